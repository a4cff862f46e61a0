#!/usr/bin/env python3
"""CAMEL call flows as hex TCAP messages for capwrite.

Each call is a TCAP dialogue between a gsmSSF (side a) and a gsmSCF (side
b): InitialDP, RequestReportBCSMEvent, ApplyCharging, Continue,
EventReportBCSM, ApplyChargingReport, ReleaseCall; busy and refused calls
(Return Error), announcements (PromptAndCollectUserInformation and its
Return Result), activity tests, SMS, rejects and aborts.  Calls overlap, as
on a real link.  The messages are built with capgen.py (the reference
tools beside the repository, ../shared/tools); the output is capwrite
input: hex lines, each after a '#@ --from a|b' line when the sender
changes, and a comment naming the message.

    callflow.py --calls 100 --seed 1 > flow.txt
    callflow.py --messages 100000 --overlap 50 --no-comments > big.txt

Python 3 standard library only.
"""

import argparse
import os
import random
import sys
from pathlib import Path

DEFAULT_TOOLS = Path(__file__).resolve().parents[3] / 'shared' / 'tools'

# How often each kind of call occurs (weights).
KINDS = (('answered', 40), ('busy', 14), ('refused', 8), ('announcement', 10),
         ('sms', 14), ('noanswer', 6), ('abort', 3), ('rejected', 2), ('activity', 3))

# Return Error codes that carry no parameter.
PLAIN_ERRORS = ('missingCustomerRecord', 'missingParameter', 'parameterOutOfRange',
                'unexpectedDataValue', 'unexpectedComponentSequence', 'unknownLegID')


def load_capgen(tools=None):
    tools = Path(tools or os.environ.get('DPX_REFERENCE_TOOLS') or DEFAULT_TOOLS)
    if not (tools / 'capgen.py').is_file():
        return None
    sys.path.insert(0, str(tools))
    import capgen  # noqa: E402 (found only at run time)
    return capgen


def _digits(rng, prefix, n):
    return prefix + ''.join(rng.choice('0123456789') for _ in range(n))


class Calls:
    """Makes calls: call(kind, otid, dtid) -> [(side, hex, description)]."""

    def __init__(self, c, rng):
        self.c = c
        self.rng = rng

    def _idp(self, phase):
        r, c = self.rng, self.c
        return c.arg_initial_dp(service_key=r.randint(1, 2000), called=_digits(r, '49', 9),
                                calling=_digits(r, '49', 10), category=10,
                                event_type=2, imsi=_digits(r, '26201', 10),
                                vlr=_digits(r, '4917', 8),
                                cell=('262', '01', r.randint(1, 0xFFFE), r.randint(1, 0xFFFE)),
                                call_ref=bytes(r.randrange(256) for _ in range(4)),
                                msc=_digits(r, '4917', 8))

    def _begin(self, otid, acn, comps):
        c = self.c
        return c.hx(c.tcap_begin(otid, c.dialogue_portion('aarq', acn), comps))

    def _cont(self, otid, dtid, comps, acn=None):
        c = self.c
        dlg = c.dialogue_portion('aare', acn) if acn else None
        return c.hx(c.tcap_continue(otid, dtid, dlg, comps))

    def _end(self, dtid, comps):
        c = self.c
        return c.hx(c.tcap_end(dtid, None, comps))

    def call(self, kind, a, b):
        """a: side a's transaction id, b: side b's."""
        c, r = self.c, self.rng
        inv = c.invoke
        phase = r.choice((2, 3, 4))
        acn = 'cap%d' % phase
        if kind == 'sms':
            acn = r.choice(('cap3-sms', 'cap4-sms'))
            return [
                ('a', self._begin(a, acn, [inv(1, 'initialDPSMS', c.arg_initial_dp_sms(
                    service_key=r.randint(1, 50), dest=_digits(r, '4917', 8),
                    calling=_digits(r, '4917', 8)))]), 'Begin: InitialDPSMS'),
                ('b', self._cont(b, a, [inv(1, 'requestReportSMSEvent', c.arg_request_report_sms_event()),
                                        inv(2, 'continueSMS')], acn),
                 'Continue: RequestReportSMSEvent, ContinueSMS'),
                ('a', self._cont(a, b, [inv(2, 'eventReportSMS', c.arg_event_report_sms())]),
                 'Continue: EventReportSMS'),
                ('b', self._end(a, None), 'End'),
            ]
        begin = ('a', self._begin(a, acn, [inv(1, 'initialDP', self._idp(phase))]), 'Begin: InitialDP')
        if kind == 'refused':
            err = r.choice(PLAIN_ERRORS)
            return [begin, ('b', self._end(a, [c.return_error(1, err)]), 'End: Return Error ' + err)]
        if kind == 'abort':
            return [begin, ('b', c.hx(c.tcap_abort(a, p_abort=r.choice((1, 2)))), 'Abort: P-Abort')]
        rrbe = inv(1, 'requestReportBCSMEvent', c.arg_request_report_bcsm_event(
            ((4, 1), (5, 1, 2), (6, 1, 2), (7, 1, 2), (9, 0, 1), (9, 0, 2))))
        charge = lambda i: inv(i, 'applyCharging', c.arg_apply_charging(  # noqa: E731
            max_duration=r.choice((60, 300, 600, 1200)), phase=phase))
        erb = lambda i, ev, **kw: inv(i, 'eventReportBCSM', c.arg_event_report_bcsm(ev, **kw))  # noqa: E731
        acr = lambda i: inv(i, 'applyChargingReport', c.arg_apply_charging_report(  # noqa: E731
            time_value=r.randint(10, 6000)))
        release = lambda i, cause: inv(i, 'releaseCall', c.arg_release_call(cause))  # noqa: E731
        if kind == 'rejected':
            return [begin,
                    ('b', self._cont(b, a, [rrbe, inv(2, 'connect', c.arg_connect(_digits(r, '4917', 8)))], acn),
                     'Continue: RequestReportBCSMEvent, Connect'),
                    ('a', self._end(b, [c.reject(2, 'invoke', r.choice((1, 2, 4)))]), 'End: Reject')]
        if kind == 'announcement':
            return [begin,
                    ('b', self._cont(b, a, [inv(1, 'connectToResource', c.arg_connect_to_resource()),
                                            inv(2, 'promptAndCollectUserInformation', c.arg_prompt_and_collect())],
                                     acn), 'Continue: ConnectToResource, PromptAndCollectUserInformation'),
                    ('a', self._cont(a, b, [c.return_result(2, 'promptAndCollectUserInformation',
                                                            c.res_prompt_and_collect(_digits(r, '', 4)))]),
                     'Continue: Return Result PromptAndCollectUserInformation'),
                    ('b', self._cont(b, a, [inv(3, 'playAnnouncement', c.arg_play_announcement(
                        message_id=r.randint(1, 5000)))]), 'Continue: PlayAnnouncement'),
                    ('a', self._cont(a, b, [inv(1, 'specializedResourceReport',
                                                c.arg_specialized_resource_report(phase=phase), linked_id=3)]),
                     'Continue: SpecializedResourceReport'),
                    ('b', self._end(a, [release(4, 31)]), 'End: ReleaseCall')]
        flow = [begin,
                ('b', self._cont(b, a, [rrbe, charge(2), inv(3, 'continue')], acn),
                 'Continue: RequestReportBCSMEvent, ApplyCharging, Continue')]
        if kind == 'busy':
            return flow + [('a', self._cont(a, b, [erb(2, 5, cause_value=17)]), 'Continue: EventReportBCSM busy'),
                           ('b', self._end(a, [release(4, 17)]), 'End: ReleaseCall')]
        if kind == 'noanswer':
            return flow + [('a', self._cont(a, b, [erb(2, 6)]), 'Continue: EventReportBCSM no answer'),
                           ('b', self._end(a, [release(4, 19)]), 'End: ReleaseCall')]
        flow += [('a', self._cont(a, b, [erb(2, 7)]), 'Continue: EventReportBCSM answer'),
                 ('a', self._cont(a, b, [acr(3)]), 'Continue: ApplyChargingReport'),
                 ('b', self._cont(b, a, [charge(4)]), 'Continue: ApplyCharging')]
        if kind == 'activity':
            flow += [('b', self._cont(b, a, [inv(5, 'activityTest')]), 'Continue: ActivityTest'),
                     ('a', self._cont(a, b, [c.return_result(5)]), 'Continue: Return Result ActivityTest')]
        return flow + [('a', self._cont(a, b, [erb(4, 9, leg=1, cause_value=16), acr(5)]),
                        'Continue: EventReportBCSM disconnect, ApplyChargingReport'),
                       ('b', self._end(a, None), 'End')]


def generate(c, seed=1, calls=None, messages=None, overlap=1):
    """Yields (side, hex, description, call number); `overlap` calls run at once."""
    rng = random.Random(seed)
    maker = Calls(c, rng)
    kinds, weights = zip(*KINDS)
    active, started, sent = [], 0, 0
    while True:
        more = (calls is None or started < calls) and (messages is None or sent < messages)
        while more and len(active) < overlap:
            kind = rng.choices(kinds, weights)[0]
            tid_a, tid_b = 0x10000000 + started, 0x80000000 + started
            active.append([started, iter(maker.call(kind, tid_a, tid_b))])
            started += 1
            more = calls is None or started < calls
        if not active or (messages is not None and sent >= messages):
            return
        slot = rng.randrange(len(active))
        item = next(active[slot][1], None)
        if item is None:
            active.pop(slot)
            continue
        sent += 1
        yield item + (active[slot][0],)


def write(items, out, comments=True):
    side = None
    for s, hexmsg, desc, call in items:
        if s != side:
            out.write('#@ --from %s\n' % s)
            side = s
        if comments:
            out.write('# call %d, %s %s\n' % (call, 'SSF->SCF' if s == 'a' else 'SCF->SSF', desc))
        out.write(hexmsg + '\n')


def main(argv=None):
    ap = argparse.ArgumentParser(description=__doc__.split('\n\n')[0])
    ap.add_argument('--calls', type=int, help='number of calls')
    ap.add_argument('--messages', type=int, help='stop after this many messages')
    ap.add_argument('--overlap', type=int, default=1, help='calls in progress at once')
    ap.add_argument('--seed', type=int, default=1)
    ap.add_argument('--no-comments', action='store_true')
    ap.add_argument('--tools', help='folder of capgen.py (default ../shared/tools)')
    a = ap.parse_args(argv)
    if a.calls is None and a.messages is None:
        ap.error('give --calls or --messages')
    c = load_capgen(a.tools)
    if c is None:
        sys.stderr.write('callflow: capgen.py not found (--tools)\n')
        return 2
    write(generate(c, a.seed, a.calls, a.messages, a.overlap), sys.stdout, not a.no_comments)
    return 0


if __name__ == '__main__':
    sys.exit(main())
