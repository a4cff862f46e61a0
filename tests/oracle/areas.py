"""The argument areas compared with tshark, as data (read by arguments.py).

TYPES and each area's operations, results and errors describe the arguments
in arguments.py's notation, written from the CAP types and not read from the
decoder's member tables: a wrong identifier or element in a table row then
shows as a disagreement instead of being mirrored by the messages.  VALUES pairs tshark fields with ours, one row a
line:  areas | value | containers | tshark fields | our field ids |
normaliser [| octet shift]  (areas: C call control, A charging, call gap and
announcements, S SMS, G GPRS; containers: an occurrence counts only inside
one of them; a field name without a dot is camel's).  NUMBERS gives the
ISUP-format numbers, whose digits and attributes become rows of VALUES.
"""

TYPES = {
    # call control
    'bool': '<- hex(00), - hex(ff), - oct(1,1)>',
    'csid': 'int(1,127)', 'side': 'one(1,2)', 'cug': 'oct(4,4)',
    'legid': 'one(1,2,1..30)', 'leg': '<80 legid, 81 legid>', 'sending': '(80 legid)',
    'receiving': '(81 legid)',
    'ext': '[30 1 2 {02 int(0,127), 0A one(0,1), A1 (04 oct(1,4))}]',
    'sii': '{A0 .4 {81 side, 82 .5 side, 84 .5 side}, A1 .3 {81 side, 82 .5 side}, '
           '82 .4 one(0,1), 84 .3 one(0..3), 8D .2 null, 9F32 .3 side, 9F33 .3 side, '
           '9F34 .3 side}',
    'carrier': 'octs(0..4) + oct(3,3)', 'alerting': 'octs(0,0,0..8)',
    'category': 'one(10,11,15,0..255)', 'eventtype': 'one(2..7,9,10,12..15,17,18)',
    'callednumbers': '[04 1 3 called]', 'genericnumbers': '[04 1 2 gnum]',
    'locinfo': '{02 .6 int(0,32767), 81 .6 addr, 82 .2 calling, A3 .8 <80 9 cell, 81 7 lai>, '
               '86 .3 addr}',
    'basicservice': '<82 one(0x11,0x12,0x21,0x10), 83 one(0x11,0x12,0x21)>',
    'bearers': '{80 bearer}',
    # the Initial DP argument extension as CAP v4 has it (its high layer
    # compatibility [8] is left out: primitive 88 where our decoder expects A8)
    'idpext': '{80 .6 addr, 81 .5 called, 82 .5 hex(531992), 83 .5 tbcd(16,16), '
              '84 .5 octs(4,0x80|0xC0|0xE0|0xF0), 85 .3 octs(0..7) + oct(1,1), A6 .5 bearers, '
              'A7 .4 basicservice, 89 .3 hex(8890), 8A .2 hex(8890a2)}',
    # charging, call gap, announcements
    'ffd': '<- oct(1,8), - oct(1,40), - oct(1,52), - oct(1,160)>',
    'burst': '{80 .6 ints(1..3), 81 .6 ints(1..127,1..127,128..1200), 82 .6 ints(1..3), '
             '83 .6 ints(1..20), 84 .6 ints(1..20)}',
    'audible': '<01 bool, A1 {80 .6 ints(1..127,128..1200), A1 burst}>',
    'tdc': '{80 ints(1..127,128..32767,32768..864000), 81 .6 bool, '
           '82 .5 ints(1..127,128..86400), A3 .4 audible, A4 .1 ext}',
    'chargingaddress': '<A2 leg, 9F32 int(1,127)>',
    'timevalue': 'ints(0..127,128..32767,32768..864000)',
    'timeinfo': '<80 timevalue, A1 {80 timevalue, 81 .6 ints(1..86400)}>',
    'sk2': 'skey(255,2147483647)', 'int4': 'ints(0..127,128..2147483647)',
    'int2': 'ints(0..127,128..32767)',
    'basicgap': '<80 4 gnum, A2 3 {80 sk2}, BD 2 {80 gnum, 81 sk2}, BE 2 {80 gnum, 81 sk2}>',
    'variablepart': '<80 int4, 81 gdigits, 82 octs(0..35,0..89), 83 oct(4,4), 84 oct(4,4)>',
    'messageid': '<80 4 int4, A1 2 {80 text(1,30), 81 .5 oct(1,2)}, BD 2 [02 1 4 int4], '
                 'BE 2 {80 int4, A1 [- 1 5 variablepart]}>',
    'its': '<A0 3 {A0 messageid, 81 .6 ints(1..127), 82 .5 int2, 83 .5 int2}, '
           'A1 1 {80 int4, 81 .5 int4}>',
    'gapcriteria': '<- 8 basicgap, 30 2 {A0 basicgap, 81 .5 oct(1,4)}>',
    'cai': '{80 .8 cai1, 81 .8 cai1, 82 .8 cai1, 83 .8 cai1, 84 .8 cai1, 85 .8 cai1, '
           '86 .8 cai1}',
    'cai1': 'ints(0..127,128..8191)', 'aocsub': '{A0 cai, 81 .5 ints(1..86400)}',
    'collected': '{80 .6 ints(1..30), 81 ints(1..30), 82 .3 oct(1,2), 83 .3 oct(1,2), '
                 '84 .3 oct(1,2), 85 .4 ints(1..127), 86 .4 ints(1..127), 87 .3 one(0,1,2), '
                 '88 .3 bool, 89 .3 bool, 8A .3 bool}',
    # SMS and GPRS
    'gsn': '<- 6 hex(10) + oct(4,4), - 4 hex(41) + oct(16,16)>',
    'cellorlai': '<- 7 cell, - 3 lai>', 'rai': 'lai + oct(1,1)',
    'octet': 'octs(0..255)', 'eventtypesms': 'one(1,2,3,11,12,13,0..255)',
    # MS network capability (two octets) and radio access capabilities of
    # several access technologies (GSM E then GSM 1800 with A5 and multislot
    # classes; GSM P with the HSCSD class; GSM 1800 then an additional list)
    'gprsmsclass': '{80 oct(2,2), 81 .5 hex(1433822a9719892800,0288db0a,3327466f6f8ba580)}',
    'locgprs': '{80 cell, 81 .5 lai + hex(07)}',
    'eventtypegprs': 'one(1,2,3,11,12,13,14)', 'volume': 'uint(0,4294967295)',
    'gtime': 'uint(0,86400)', 'ro': 'uint(0,255)', 'chargingid': 'oct(4,4)',
    'rollover': '<80 ro, A1 {80 .7 ro, 81 .6 ro}>',
    'qosformat': '<80 oct(3,3), 81 oct(1,9)>', 'qosext': '{80 oct(1,3)}',
    'qos': '{A0 .6 qosformat, A1 .6 qosformat, A2 .6 qosformat, A3 .2 qosext, A4 .2 qosext, '
           'A5 .2 qosext}',
    'enduser': '{80 one(0xF1,0xF0), 81 one(0x21,0x57,0x8D,0x01), '
               '82 .7 <- 7 oct(4,4), - 3 oct(16,16)>}',
    'locgprs2': '{80 .7 cellorlai, 81 .6 rai, 82 .2 hex(10) + oct(7,7), 83 .4 addr, '
                '84 .3 oct(3,3), 86 .3 null}',
    'detach': '{80 .8 one(0,1,2,3), 81 .4 null}',
    'esi': '<A0 {A0 .8 locgprs2}, A1 {80 .6 apn, 81 .6 chargingid, A2 .6 locgprs2, '
           'A3 .6 enduser, A4 .5 qos, 85 .5 time, 86 .5 gsn}, A2 detach, A3 detach, '
           'A4 {80 .6 apn, A1 .6 enduser, A2 .5 qos, A3 .6 locgprs2, 84 .5 time, 85 .5 one(0,1), '
           '86 .2 null}, A5 {80 .6 apn, 81 .6 chargingid, A2 .6 enduser, A3 .5 qos, '
           'A4 .6 locgprs2, 85 .5 time, 86 .5 gsn}>',
}

CWA = ('continueWithArgument', '30 {81 .2 alerting, A6 .2 ext, A7 .2 sii, 8C .5 category, '
       'B0 .3 genericnumbers, 91 .2 cug, 92 .1 null, 9F32 .4 calling, 9F34 .2 carrier, '
       '9F37 .3 null, 9F38 .2 one(0..255), 9F39 .1 null, 9F3A .1 null, BF3B .3 {80 .4 null, '
       '81 .4 null, 82 .4 null, A3 .6 <80 csid, A1 leg>}}')
# Event Report BCSM: the event type and, for most types, its specific information
ERB_SPECIFIC = {4: 'A2 {80 .8 cause}', 5: 'A3 {80 .8 cause}', 6: 'A4 null',
                7: 'A5 {9F32 .5 called}', 9: 'A7 {80 .8 cause}',
                13: 'A8 {80 .8 cause, 9F32 .3 null}', 14: 'A9 {9F32 .3 null}',
                15: 'AA {9F32 .5 called}', 17: 'AC {80 .8 cause}'}
ERB_EVENTS = ', '.join('- {80 hex(%02x)%s}' % (t, ', A2 .8 {%s}' % ERB_SPECIFIC[t]
                                             if t in ERB_SPECIFIC else '')
                       for t in (2, 3, 4, 5, 6, 7, 9, 10, 12, 13, 14, 15, 17, 18))

AREAS = [
    dict(name='call control', title='call-control arguments', letter='C', seed=0, phase=4,
         not_decoded_by_tshark={'op 56': 'opcode-56-not-decoded-by-tshark'},
         rules='digits-all-half-octets tbcd-filler-shown mnc-high-half-first '
               'time-zone-bit-layout stop-time-octets tshark-shows-octet-garbled '
               'opcode-56-not-decoded-by-tshark components-not-reached',
         ops={
             0: ('initialDP', '30 {80 skey, 82 .9 called, 83 .9 calling, 85 .7 category, '
                 '87 .2 one(0..7), 88 .2 one(0..255), 8A .4 calling, 8C .4 original, AF .2 ext, '
                 '97 .2 octs(0x91,0x81|0x84|0xA1), 99 .3 gnum(6), BB .5 bearers, '
                 '9C .8 eventtype, 9D .3 original, 9E .3 redirection, 91 .3 cause, BF20 .2 sii, '
                 '9F25 .2 carrier, 9F2D .2 int(0,32767), 9F2E .2 cug, 9F2F .1 null, 9F32 .8 imsi, '
                 'BF33 .3 <80 null, 81 null, 82 null, 0A one(0..3)>, BF34 .7 locinfo, '
                 'BF35 .5 basicservice, 9F36 .5 oct(1,8), 9F37 .6 addr, 9F38 .4 addr(1,24), '
                 '9F39 .5 time, 9F3A .1 null, BF3B .4 idpext}'),
             16: ('assistRequestInstructions', '30 {80 gnum, 82 one(0..255), A3 .2 ext}'),
             17: ('establishTemporaryConnection', '30 {80 gnum, 81 .6 gnum, 83 .3 oct(1,4), '
                  'A4 .2 ext, 85 .2 carrier, A6 .2 sii, 9F32 .2 one(0..255), 9F33 .4 calling}'),
             19: ('connectToResource', '30 {- <80 6 called, 83 4 null>, A4 .2 ext, A7 .2 sii, '
                  '9F32 .3 csid}'),
             20: ('connect', '30 {A0 callednumbers, 81 .2 alerting, 86 .4 original, AA .2 ext, '
                  '8B .2 carrier, 9C .4 category, 9D .3 original, 9E .3 redirection, '
                  'AE .3 genericnumbers, AF .2 sii, 93 .4 calling, 9F1F .2 cug, 9F20 .1 null, '
                  '9F37 .2 null, 9F38 .2 null, 9F39 .2 one(0..255), 9F3A .1 null}'),
             22: ('releaseCall', '04 cause'),
             23: ('requestReportBCSMEvent', '30 {A0 [30 1 4 {80 eventtype, 81 one(0,1,2), '
                  'A2 .7 sending, BE .2 {81 int(0,2047)}, 9F32 .1 null}], A2 .2 ext}'),
             24: ('eventReportBCSM', '30 {- <%s>, A3 .7 receiving, A4 .7 {80 one(0,1)}}'
                  % ERB_EVENTS),
             32: ('initiateCallAttempt', '30 {A0 callednumbers, A4 .2 ext, A5 .5 sending, '
                  '86 .4 csid, 9E .6 calling, 9F33 .4 oct(1,8), 9F34 .4 addr, 9F35 .2 null}'),
             33: ('resetTimer', '30 {80 one(0), 81 sk2, A2 .2 ext, 83 .3 csid}'),
             44: ('callInformationReport', '30 {A0 [30 1 4 <- {80 hex(00), A1 {80 int(0,255)}}, '
                  '- {80 hex(01), A1 {81 dtime}}, - {80 hex(02), A1 {82 int(0,2147483647)}}, '
                  '- {80 hex(1E), A1 {9E cause}}>], A2 .2 ext, A3 .7 receiving}'),
             45: ('callInformationRequest', '30 {A0 [0A 1 4 one(0,1,2,30)], A2 .2 ext, '
                  'A3 .7 sending}'),
             53: ('cancel', '- <80 6 int(-128,127), 81 4 null>'),
             56: CWA, 88: CWA,
             86: ('dFCWithArgument', '30 {81 .7 csid, A2 .3 ext}'),
             90: ('disconnectLeg', '30 {A0 leg, 81 .6 cause, A2 .2 ext}'),
             93: ('moveLeg', '30 {A0 leg, A2 .2 ext}'),
             95: ('splitLeg', '30 {A0 leg, 81 .6 csid, A2 .2 ext}'),
             # callSegmentFailure [0] {callSegmentID [0], cause [2]} or
             # bCSM-Failure [1] {legID [0], cause [2]}
             96: ('entityReleased', '- <A0 {80 .8 csid, 82 .8 cause}, '
                  'A1 {A0 .8 leg, 82 .8 cause}>'),
         }),
    dict(name='charging', title='charging, call gap and announcement arguments, results and '
         'errors', letter='A', seed=0, phase=4, plain_null=(49,),
         rules='digits-all-half-octets gap-interval-two-octets free-format-data-52-octets '
               'call-attempt-result-three-members result-sequence-indefinite '
               'components-not-reached',
         ops={
             34: ('furnishChargingInformation', '04 {A0 {80 ffd, A1 .6 sending, '
                  '82 .5 one(0,1)}}'),
             35: ('applyCharging', '30 {80 (A0 tdc), A2 .7 sending, A3 .1 ext, '
                  'BF32 .3 chargingaddress}'),
             36: ('applyChargingReport', '04 {A0 {A0 receiving, A1 timeinfo, 82 .7 bool, '
                  '83 .3 null, A4 .1 ext, A5 .3 chargingaddress}}'),
             41: ('callGap', '30 {A0 gapcriteria, A1 {80 ints(-2..127,128..86400), '
                  '81 ints(-1..127,128..32767,32768..60000)}, 82 .4 one(0,1), '
                  'A3 .5 <A0 its, 81 cause>, A4 .1 ext}'),
             46: ('sendChargingInformation', '30 {80 <A0 {A0 cai, A1 .5 aocsub}, A1 aocsub>, '
                  'A1 sending, A2 .1 ext}'),
             47: ('playAnnouncement', '30 {A0 its, 81 .6 bool, 82 .6 bool, A3 .1 ext, '
                  '85 .3 int(1,127), 9F33 .3 bool}'),
             48: ('promptAndCollectUserInformation', '30 {A0 {A0 collected}, 81 .6 bool, '
                  'A2 .6 its, A3 .1 ext, 84 .3 int(1,127), 9F33 .3 bool}'),
             49: ('specializedResourceReport', '- <9F32 null, 9F33 null>'),
             97: ('playTone', '30 {A0 <80 int(1,127), A1 2 leg>, A1 burst, A2 .1 ext}'),
         },
         # what follows the operation code in the result SEQUENCE
         results={55: '- null', 70: '- null', 72: '- null', 76: '- null', 80: '- null',
                  48: '80 gdigits',
                  32: '30 {80 .7 octs(0..7,0x80|0xC0|0xE0|0xF0), 81 .6 octs(0..7) + oct(1,2), '
                      'A2 .1 ext, 83 .2 null}'},
         # every error code; these carry a parameter
         errors={1: '30 (80 int(0,2)) + (81 int(-128,127))', 10: '0A int(1,2)',
                 11: '0A int(0,6)', 12: '0A int(0,2)'}),
    dict(name='sms', title='SMS arguments', letter='S', seed=600, phase=4,
         # the GPRS elements of SMS Initial DP (location information GPRS [6],
         # GPRS MS class [18]): their values are compared in the GPRS area
         hidden=(0xA6, 0xB2), rules='digits-all-half-octets tbcd-filler-shown mnc-high-half-first '
                                    'time-zone-bit-layout free-format-data-52-octets '
                                    'components-not-reached',
         ops={
             60: ('initialDPSMS', '30 {80 skey, 81 .8 addr(1,24), 82 .8 addr, '
                  '83 .8 one(1,11,0..255), 84 .8 imsi, A5 .5 locinfo, A6 .05 locgprs, 87 .7 addr, '
                  '88 .6 time, 89 .6 octet, 8A .6 octet, 8B .6 octet, 8C .5 validity, AD .1 ext, '
                  '8E .5 oct(1,8), 8F .5 addr, 90 .3 addr, 91 .4 oct(3,3), B2 .05 gprsmsclass, '
                  '93 .4 tbcd(15,16), 94 .3 addr}'),
             61: ('furnishChargingInformationSMS', '04 {A0 {80 ffd, 81 .5 one(0,1)}}'),
             62: ('connectSMS', '30 {80 .6 addr, 81 .8 addr(1,24), 82 .6 addr, AA .1 ext}'),
             63: ('requestReportSMSEvent', '30 {A0 [30 1 5 {80 eventtypesms, 81 one(0,1,2)}], '
                  'AA .1 ext}'),
             64: ('eventReportSMS', '30 {80 eventtypesms, A1 .7 <A0 {80 .7 one(0..4,0..255)}, '
                  'A1 null, A2 {80 .7 one(1,21,22,27,111,0..255)}, A3 null>, '
                  'A2 .6 {80 one(0,1)}, AA .1 ext}'),
             66: ('releaseSMS', '04 one(1,8,10,21,27,41,47,111,0..255)'),
             67: ('resetTimerSMS', '30 {80 .5 one(0), 81 ints(1..127,128..86400), A2 .1 ext}'),
         }),
    dict(name='gprs', title='GPRS arguments', letter='G', seed=700, phase=None,
         field_rules={'camel.long_QoS_format': 'long-qos-format-not-compared'},
         rules='tbcd-filler-shown mnc-high-half-first long-qos-format-not-compared '
               'components-not-reached',
         ops={
             71: ('applyChargingGPRS', '30 {A0 <80 volume, 81 gtime>, 81 .4 uint(1,86400), '
                  '82 .5 octet}'),
             72: ('applyChargingReportGPRS', '30 {A0 <A0 <80 volume, A1 {80 volume, '
                  '81 .6 volume}>, A1 <80 gtime, A1 {80 gtime, 81 .6 gtime}>>, A1 .4 qos, '
                  '82 .6 bool, 83 .5 octet, A4 .3 <A0 rollover, A1 rollover>}'),
             73: ('cancelGPRS', '30 {80 .7 octet}'),
             74: ('connectGPRS', '30 (80 apn) + {81 .5 octet}'),
             75: ('continueGPRS', '30 {80 .7 octet}'),
             76: ('entityReleasedGPRS', '30 {80 one(0..255), 81 .5 octet}'),
             77: ('furnishChargingInformationGPRS', '04 (30 (A0 {80 oct(1,40), 81 .5 octet, '
                  '82 .5 one(0,1)}))'),
             78: ('initialDPGPRS', '30 {80 skey, 81 eventtypegprs, 82 addr, 83 imsi, 84 time, '
                  'A5 .05 gprsmsclass, A6 .6 enduser, A7 .5 qos, 88 .7 apn, 89 .6 rai, '
                  '8A .5 chargingid, 8B .4 one(0,1), AC .6 locgprs2, 8D .5 one(0,1), AE .1 ext, '
                  '8F .5 gsn, 90 .2 null, 91 .3 oct(8,8)}'),
             79: ('releaseGPRS', '30 {80 one(0..255), 81 .5 octet}'),
             80: ('eventReportGPRS', '30 {80 eventtypegprs, A1 {80 one(0,1)}, A2 .8 esi, '
                  '83 .5 octet}'),
             81: ('requestReportGPRSEvent', '30 {A0 [30 1 5 {80 eventtypegprs, '
                  '81 one(0,1,2)}], 81 .5 octet}'),
             82: ('resetTimerGPRS', '30 {80 .5 one(0), 81 uint(1,86400)}'),
             83: ('sendChargingInformationGPRS', '30 (80 (30 (A0 {A0 cai, A1 .5 aocsub}) + '
                  '{81 .4 octet}))'),
         }),
]

NUMBER_ATTRIBUTES = (
    ('nature of address', 'isup.calling_party_nature_of_address_indicator '
                          'isup.called_party_nature_of_address_indicator'),
    ('numbering plan', 'isup.numbering_plan_indicator'),
    ('presentation', 'isup.address_presentation_restricted_indicator'),
    ('screening', 'isup.screening_indicator isup.screening_indicator_enhanced'),
    ('NI', 'isup.ni_indicator'), ('INN', 'isup.inn_indicator'),
    ('qualifier', 'isup.number_qualifier_indicator'))
# areas | number | containers | tshark's digits | our digit ids | digits
# normaliser | our ids of NUMBER_ATTRIBUTES (0: not shown)
NUMBERS = '''
C  | called number | calledPartyNumber CalledPartyNumber ipRoutingAddress forwardingDestinationNumber destinationAddress | isup.called | 3589 3592 | digits | 1819 1822 0 0 0 1823 0
C  | calling number | callingPartyNumber | isup.calling | 1628 1631 | digits | 1617 1621 1620 1619 1622 0 0
C  | location number | locationNumber | isup.location_number | 1663 | halves | 3557 3569 1662 3560 0 3575 0
CS | location information: location number | gsm_map.ms.locationNumber | isup.location_number | 2069 | halves | 2064 2066 2067 2068 0 2065 0
C  | original called | originalCalledPartyID | isup.original_called_number | 1646 | halves | 1642 1644 1645 0 0 0 0
C  | redirecting | redirectingPartyID | isup.redirecting | 1818 | halves | 1814 1816 1817 0 0 0 0
C  | additional calling | additionalCallingPartyNumber | isup.generic_number | 1670 | halves | 1664 1667 1669 1666 1668 0 1659
C  | generic number | GenericNumber assistingSSPIPRoutingAddress correlationID | isup.generic_number | 1663 | halves | 3554 3566 1662 3563 3572 0 1657
A  | gap criteria: address | calledAddressValue callingAddressValue | isup.generic_number | 1663 | halves | 3554 3566 1662 3563 3572 0 1657
C  | charge number | chargeNumber | isup.location_number | 3600 3603 | digits | 1942 1944 0 0 0 0 0
'''


def number_rows():
    out = []
    for line in NUMBERS.strip().splitlines():
        areas, name, boxes, tdigits, ids, norm, attrs = [c.strip() for c in line.split('|')]
        out.append(' | '.join((areas, name + ' digits', boxes, tdigits, ids, norm)))
        out += [' | '.join((areas, '%s %s' % (name, attr), boxes, tnames, fid, 'int'))
                for (attr, tnames), fid in zip(NUMBER_ATTRIBUTES, attrs.split()) if fid != '0']
    return '\n'.join(out)


ISDN = 'gsm_map.ms.vlr_number gsm_map.ms.msc_Number mscAddress gsmSCFAddress gmscAddress'
SMS_ADDRESSES = 'callingPartyNumber callingPartysNumber sMSCAddress mscAddress sgsn_Number ' \
    'calledPartyNumber'
TIME = 'CS | %s | | timeAndTimezone | %d | time:%s'
VALIDITY = 'S | TP validity period: %s | | tPValidityPeriod | %d | validity:%s'
QOS = 'G | QoS: %s | short_QoS_format | gsm_a.gm.sm.qos.%s | %d | int'
TP = 'S | %s | | %s | %d | bits:%s'
VALUES = '\n'.join([number_rows()] + [
    TIME % ('time: ' + p if p in ('year', 'month', 'day', 'hour', 'minute', 'second') else
            'time zone' + (' sign' if p == 'sign' else ''), 2233 + i, p)
    for i, p in enumerate(('year', 'month', 'day', 'hour', 'minute', 'second', 'sign', 'zone'))
] + [VALIDITY % (p, fid, p) for p, fid in (
    ('relative', 2271), ('year', 2263), ('month', 2264), ('day', 2265), ('hour', 2266),
    ('minute', 2267), ('second', 2268), ('sign', 2269), ('zone', 2270))
] + [QOS % row for row in (
    ('reliability class', 'reliability_cls', 2380), ('delay class', 'delay_cls', 2381),
    ('precedence class', 'prec_class', 2382), ('peak throughput', 'peak_throughput', 2383),
    ('mean throughput', 'mean_throughput', 2384))
] + [TP % row for row in (
    ('TP reply path', 'tPShortMessageSpecificInfo', 2243, '7:1'),
    ('TP user data header indicator', 'tPShortMessageSpecificInfo', 2244, '6:1'),
    ('TP status report request', 'tPShortMessageSpecificInfo', 2245, '5:1'),
    ('TP validity period format', 'tPShortMessageSpecificInfo', 2246, '3:2'),
    ('TP reject duplicates', 'tPShortMessageSpecificInfo', 2247, '2:1'),
    ('TP message type indicator', 'tPShortMessageSpecificInfo', 2248, '0:2'),
    # protocol identifier: by its use (bits 8-7)
    ('TP-PID use', 'tPProtocolIdentifier', 2251, '6:2'),
    ('TP-PID telematic device', 'tPProtocolIdentifier', 2253, '0:5:6:0-0'),
    ('TP-PID telematic interworking', 'tPProtocolIdentifier', 2254, '5:1:6:0-0'),
    ('TP-PID short message type', 'tPProtocolIdentifier', 2255, '0:6:6:1-1'),
    ('TP-PID reserved or SC specific', 'tPProtocolIdentifier', 2252, '0:6:6:2-3'),
    # data coding scheme: by its coding group (bits 8-5)
    ('TP-DCS coding group', 'tPDataCodingScheme', 2274, '4:4'),
    ('TP-DCS compressed', 'tPDataCodingScheme', 2279, '5:1:4:0-3'),
    ('TP-DCS compressed (automatic deletion)', 'tPDataCodingScheme', 2282, '5:1:4:4-7'),
    ('TP-DCS class meaning', 'tPDataCodingScheme', 2276, '4:1:4:0-7'),
    ('TP-DCS alphabet', 'tPDataCodingScheme', 2278, '2:2:4:0-3'),
    ('TP-DCS alphabet (automatic deletion)', 'tPDataCodingScheme', 2281, '2:2:4:4-7'),
    ('TP-DCS message class', 'tPDataCodingScheme', 2280, '0:2:4:0-7'),
    ('TP-DCS indication sense', 'tPDataCodingScheme', 2284, '3:1:4:12-14'),
    ('TP-DCS indication type', 'tPDataCodingScheme', 2283, '0:2:4:12-14'),
    ('TP-DCS message coding', 'tPDataCodingScheme', 2286, '2:1:4:15-15'),
    ('TP-DCS data coding class', 'tPDataCodingScheme', 2285, '0:2:4:15-15'))
]) + '''
CASG | service key | | serviceKey | 1611 | int
C    | event type BCSM | | eventTypeBCSM | 1557 | int
C    | calling party's category | | callingPartysCategory | 1634 | octet
CA   | cause value | | cause_indicator | 1480 | int
CA   | cause location | | q931.cause_location | 1476 | int
C    | cause / bearer / high layer coding standard | | q931.coding_standard | 1477 1705 1673 | int
C    | high layer interpretation | | q931.interpretation | 1675 | int
C    | high layer presentation method | | q931.presentation_method_protocol_profile | 1676 | int
C    | high layer characteristics | | q931.high_layer_characteristics | 1677 | int
C    | bearer transfer capability | | q931.information_transfer_capability | 1704 | int
C    | bearer transfer rate | | q931.information_transfer_rate | 1707 | int
C    | bearer rate multiplier | | q931.bearer_capability.rate_multiplier | 1712 | int
C    | bearer transfer mode | | q931.transfer_mode | 1708 | int
C    | bearer layer 1 protocol | | q931.uil1 | 1725 | int
CSG  | IMSI digits | iMSI | e212.imsi | 2025 2029 | digits
CS   | ISDN address digits (VLR, MSC, gsmSCF) | ISDN | e164.msisdn e212.imsi gsm_map.address.digits | 2058 | filler
C    | ISDN address nature of address | ISDN | gsm_map.nature_of_number | 2055 | int
C    | ISDN address numbering plan | ISDN | gsm_map.number_plan | 2054 | int
CS   | called BCD digits | | gsm_a.dtap.cld_party_bcd_num | 2141 | filler
CS   | called BCD type of number | | gsm_a.dtap.type_of_number | 2140 | int
CS   | called BCD numbering plan | | gsm_a.dtap.numbering_plan_id | 2139 | int
CS   | age of location information | | gsm_map.ms.ageOfLocationInformation | 2046 | int
CS   | cell id: MCC | | gsm_map.cellGlobalIdOrServiceAreaIdFixedLength | 2079 | cgi:mcc
CS   | cell id: MNC | | gsm_map.cellGlobalIdOrServiceAreaIdFixedLength | 2083 2086 | cgi:mnc
CS   | cell id: LAC | | gsm_map.cellGlobalIdOrServiceAreaIdFixedLength | 2087 | cgi:lac
CS   | cell id: cell identity | | gsm_map.cellGlobalIdOrServiceAreaIdFixedLength | 2088 | cgi:ci
CS   | LAI: MCC | | e212.lai.mcc | 2079 | digits
CS   | LAI: MNC | | e212.lai.mnc | 2083 2086 | mnc
CS   | LAI: LAC | | gsm_map.laiFixedLength | 2087 | cgi:lac
CA   | leg id: sending side | | inap.sendingSideID sendingSideID | 1543 1551 | const:128 | -2
CA   | leg id: receiving side | | inap.receivingSideID receivingSideID | 1543 1547 | const:129 | -2
CA   | leg id: side value | | inap.sendingSideID inap.receivingSideID sendingSideID receivingSideID | 1554 | int:16
CSG  | monitor mode | | monitorMode | 1909 | int
C    | application timer | | applicationTimer | 1916 | int
CS   | misc call info: message type | | inap.messageType | 1608 | int
C    | CG encountered | | cGEncountered | 1637 | int
C    | call segment id | | callSegmentID newCallSegment | 4181 | octets
C    | CUG index | | cug_Index | 1193 | int
C    | CUG interlock | | cug_Interlock | 1948 | uint
C    | NA Oli info | | naOliInfo | 2017 | int:16
C    | carrier selection | | carrier | 1955 | at:0
C    | alerting pattern: type | | alertingPattern | 1128 | at:2
C    | service interaction: conference treatment | | conferenceTreatmentIndicator | 1977 | int:16
C    | service interaction: hold treatment | | holdTreatmentIndicator | 2001 | int
C    | service interaction: bothway through connection | | bothwayThroughConnectionInd | 1993 | int
C    | service interaction: connected number treatment | | connectedNumberTreatmentInd | 1996 | int
C    | cancel: invoke id | | invokeID | 1531 | int8
CS   | timer id | | timerID | 2306 | int
CSG  | timer value | | timervalue | 1376 | int
C    | requested info type (report) | | requestedInformationType | 1504 | int
C    | requested info type (request) | | RequestedInformationType | 1527 | int
C    | call attempt elapsed time | | callAttemptElapsedTimeValue | 1510 | int
C    | call connected elapsed time | | callConnectedElapsedTimeValue | 1519 | int
C    | call stop time: year | | callStopTimeValue | 1512 | stop:0
C    | call stop time: month | | callStopTimeValue | 1513 | stop:1
C    | call stop time: second | | callStopTimeValue | 1517 | stop:5
C    | redirecting indicator | | isup.redirecting_ind | 1826 | int
C    | original redirection reason | | isup.original_redirection_reason | 1827 | int
C    | redirection counter | | isup.redirection_counter | 1828 | int
C    | redirecting reason | | isup.redirection_reason | 1829 | int
C    | ext basic service code: bearer | ext_basicServiceCode | gsm_map.ext_BearerService | 2053 | int
C    | ext basic service code: teleservice | ext_basicServiceCode | gsm_map.ext_Teleservice | 2057 | int
C    | call reference number | | callReferenceNumber | 2135 4177 | octets
CS   | IDP extension: MS classmark 2 | | ms_Classmark2 | 4218 | octets
CS   | IDP extension: IMEI | | iMEI | 4221 | octets
C    | IDP extension: supported CAMEL phases | | supportedCamelPhases | 4192 | octets:-1 | -1
C    | IDP extension: offered CAMEL4 functionalities | | offeredCamel4Functionalities | 4195 | octets:-1 | -1
C    | IDP extension: basic service code | | ext_basicServiceCode2 | 4224 | octets:-2 | -2
C    | IDP extension: low layer compatibility | | lowLayerCompatibility lowLayerCompatibility2 | 4228 | octets
A    | max call period duration | | maxCallPeriodDuration | 1389 | int
A    | release if duration exceeded | | releaseIfdurationExceeded | 1392 | bool
AG   | tariff switch interval | | tariffSwitchInterval | 1396 | int
A    | warning tone | | tone | 4237 | bool
A    | warning period | | warningPeriod | 4243 | int
A    | burst: number of bursts | | numberOfBursts | 4254 | int
A    | burst: interval | | burstInterval | 4257 | int
A    | burst: tones in burst | | numberOfTonesInBurst | 4260 | int
A    | burst: tone duration | bursts_element PlayToneArg_element | toneDuration | 4263 | int
A    | burst: tone interval | | toneInterval | 4266 | int
A    | time if no tariff switch | | timeIfNoTariffSwitch | 1415 | int
A    | time since tariff switch | | timeSinceTariffSwitch | 1420 | int
A    | call active | | legActive | 1423 | bool
AS   | free format data | | freeFormatData | 2188 | freeformat
ASG  | append free format data | | appendFreeFormatData | 2191 | int
AG   | AOC: E1-E7 | | e1 e2 e3 e4 e5 e6 e7 | 1283 1286 1289 1292 1295 1298 1301 | int
A    | gap duration | | gapIndicatorsDuration | 1466 | uint
A    | gap interval | | gapInterval | 1463 | gapinterval
A    | control type | | controlType | 1469 | int
A    | elementary message id | | elementaryMessageID | 1335 | int
A    | elementary message ids | | Integer4 | 1349 | int
A    | message content | | messageContent | 1341 | octets
A    | message attributes | | attributes | 1344 | octets
A    | number of repetitions | | numberOfRepetitions | 1322 | int
A    | inband duration | | inbandInfoDuration | 1325 | int
A    | inband interval | | interval | 1328 | int
A    | tone id | | toneID | 1311 | uint
A    | tone duration | tone_element | toneDuration | 1314 | int
A    | variable part: integer | | integer | 1359 | int
A    | variable part: number type of digits | number | isup.generic_digits | 1649 | bits:0:5
A    | variable part: number digits | number | isup.generic_digits | 3539 3551 | gdigits
A    | variable part: time hour | | time | 1362 | at:0
A    | variable part: time minute | | time | 1363 | at:1
A    | variable part: date year | | date | 1366 | uint:2
A    | variable part: date month | | date | 1367 | at:2
A    | variable part: date day | | date | 1368 | at:3
A    | variable part: price | | price | 1371 | octets
A    | call segment id | | callSegmentID srfConnection | 4181 | octets
A    | disconnect from IP forbidden | | disconnectFromIPForbidden | 1835 | bool
A    | request announcement complete | | requestAnnouncementCompleteNotification | 1839 | bool
A    | request announcement started | | requestAnnouncementStartedNotification | 4237 | bool
A    | collected digits: minimum | | minimumNbOfDigits | 1863 | int
A    | collected digits: maximum | | maximumNbOfDigits | 1866 | int
A    | collected digits: end of reply digit | | endOfReplyDigit | 1869 | uint
A    | collected digits: cancel digit | | cancelDigit | 1872 | uint
A    | collected digits: start digit | | startDigit | 1875 | uint
A    | collected digits: first digit time-out | | firstDigitTimeOut | 1878 | int
A    | collected digits: inter-digit time-out | | interDigitTimeOut | 1881 | int
A    | collected digits: error treatment | | errorTreatment | 1884 | int
A    | collected digits: interruptable announcement | | interruptableAnnInd | 1887 | bool
A    | collected digits: voice information | | voiceInformation | 1891 | bool
A    | collected digits: voice back | | voiceBack | 1895 | bool
A    | digits response: type of digits | digitsResponse | isup.generic_digits | 1647 | bits:0:5
A    | digits response: digits | digitsResponse | isup.generic_digits | 3536 3548 | gdigits
A    | initiate call attempt: supported CAMEL phases | | supportedCamelPhases | 4192 | octets:-1 | -1
A    | initiate call attempt: offered CAMEL4 functionalities | | offeredCamel4Functionalities | 4195 | octets:-1 | -1
A    | cancel failed: problem | | problem | 1924 | int
A    | cancel failed: operation | | operation | 1927 | int8
A    | requested info error | | PAR_requestedInfoError | 1930 | int
A    | system failure: unavailable network resource | | UnavailableNetworkResource | 1934 | int
A    | task refused | | PAR_taskRefused | 1937 | int
S    | event type SMS | | eventTypeSMS | 2169 | int
S    | event specific info SMS | | eventSpecificInformationSMS | 2172 | choice | -2
S    | O SMS failure cause | | mo-smsfailureCause | 2179 | int
S    | MT SMS cause | | t-smsfailureCause | 4315 | bits:0:7
S    | RP cause | | RP_Cause | 2290 | int
S    | SMS reference number | | smsReferenceNumber | 4177 | octets
S    | SMS address digits | SMS_ADDRESSES | e164.msisdn e212.imsi gsm_map.address.digits | 2058 | filler
S    | SMS address nature of address | SMS_ADDRESSES | gsm_map.nature_of_number | 2055 | int
S    | SMS address numbering plan | SMS_ADDRESSES | gsm_map.number_plan | 2054 | int
G    | event type GPRS | | gPRSEventType | 2433 | int
G    | MSISDN digits | mSISDN | e164.msisdn gsm_map.address.digits e212.imsi | 2058 | filler
G    | PDP type organisation | | pDPTypeOrganization | 2472 | int:16
G    | PDP type number | | pDPTypeNumber | 2475 | int:16
G    | PDP address | | pDPAddress | 2478 | octets
G    | access point name octets | | accessPointName | 2413 | octets
G    | RAI: MCC | routeingAreaIdentity | e212.rai.mcc | 2442 | digits
G    | RAI: MNC | routeingAreaIdentity | e212.rai.mnc | 2449 2446 | mnc
G    | RAI: LAC | routeingAreaIdentity | gsm_a.lac | 2450 | int
G    | RAI: RAC | routeingAreaIdentity | gsm_a.gm.gmm.rac | 2451 | int
G    | location: cell or LAI MCC | | cellGlobalIdOrServiceAreaIdOrLAI | 2079 | cgi:mcc
G    | location: cell or LAI MNC | | cellGlobalIdOrServiceAreaIdOrLAI | 2083 2086 | cgi:mnc
G    | location: cell or LAI LAC | | cellGlobalIdOrServiceAreaIdOrLAI | 2087 | cgi:lac
G    | charging id | | chargingID | 2463 | octets
G    | SGSN capabilities: AOC support | | sGSNCapabilities | 2554 | bits:0:1
G    | GSN address | | gsn_Address gGSNAddress | 2594 2590 | octets:1
G    | PDP initiation type | | pDPInitiationType | 2583 | int
G    | initiating entity | | initiatingEntity | 2484 | int
G    | GPRS cause | | gprsCause gPRSCause | 2424 | int:16
G    | PDP ID | | pDPID pdpID | 1270 | int:16
G    | misc info: message type | | inap.messageType messageType | 1608 | int
G    | active | | active | 2364 | bool
G    | max transferred volume | | maxTransferredVolume | 2317 | int
G    | max elapsed time | | maxElapsedTime | 2318 | int
G    | volume if no tariff switch | | volumeIfNoTariffSwitch | 2335 | int
G    | volume since last tariff switch | | volumeSinceLastTariffSwitch | 2343 | int
G    | volume tariff switch interval | | volumeTariffSwitchInterval | 2346 | int
G    | time if no tariff switch | | timeGPRSIfNoTariffSwitch | 2350 | int
G    | time since last tariff switch | | timeGPRSSinceLastTariffSwitch | 2358 | int
G    | time tariff switch interval | | timeGPRSTariffSwitchInterval | 2361 | int
G    | roll-over volume if no tariff switch | | rO_VolumeIfNoTariffSwitch | 3888 | int
G    | roll-over volume since last switch | | rO_VolumeSinceLastTariffSwitch | 3896 | int
G    | roll-over volume switch interval | | rO_VolumeTariffSwitchInterval | 3899 | int
G    | roll-over time if no tariff switch | | rO_TimeGPRSIfNoTariffSwitch | 3903 | int
G    | roll-over time since last switch | | rO_TimeGPRSSinceLastTariffSwitch | 3911 | int
G    | roll-over time switch interval | | rO_TimeGPRSTariffSwitchInterval | 3914 | int
G    | free format data | | fCIBCCCAMELsequence1_freeFormatData freeFormatData | 2188 | freeformat
'''.replace('| ISDN |', '| %s |' % ISDN).replace('| SMS_ADDRESSES |', '| %s |' % SMS_ADDRESSES)

RULE_TEXT = {
    'digits-all-half-octets': 'location, original called, redirecting, generic and additional '
                              'calling numbers show every half-octet (odd/even not applied): '
                              'an odd count ends with the filler digit',
    'tbcd-filler-shown': 'ISDN address and called BCD digits show the filler half-octet as f',
    'mnc-high-half-first': 'MNC shown in span order, octet 3 bits 8-5 before bits 4-1 '
                           '(tshark: 15, ours: 51)',
    'time-zone-bit-layout': 'time zone read as sign in bit 8 and value in bits 7-1 (3GPP: '
                            'swapped BCD quarters, sign in bit 4)',
    'stop-time-octets': 'call stop time shows its octets as on the wire, the year as one '
                        '16-bit read, low octet first (tshark: swapped BCD date and time)',
    'invoke-indefinite': 'TCAP: an indefinite Invoke\'s end-of-contents is not read (flag 0x10)',
    'component-indefinite': 'TCAP: an indefinite Return Result or Return Error\'s '
                            'end-of-contents is not read (flag 0x10)',
    'external-indefinite': 'TCAP: an indefinite EXTERNAL in a definite dialogue portion is '
                           'read in definite mode: its end-of-contents is left in the dialogue '
                           'portion\'s window (flag 0x10)',
    'tshark-shows-octet-garbled': 'not our rule: tshark shows the calling party\'s category '
                                  'through a mis-sized integer; the octet is compared',
    'opcode-56-not-decoded-by-tshark': 'operation 56 (Continue With Argument, old code): '
                                       'tshark does not decode its argument',
    'components-not-reached': 'TCAP-level rule (indefinite message or dialogue portion): the '
                              'component is not decoded, so neither is its argument',
    'gap-interval-two-octets': 'gap interval read from at most two octets: 32768-60000 (BER '
                               '00 8x xx) show the first two, the third is left over '
                               '(flag 0x10)',
    'free-format-data-52-octets': 'free format data shows at most 52 octets; the rest of a '
                                  'longer one (CAP v3/v4: up to 160) is left over (flag 0x10)',
    'call-attempt-result-three-members': 'Initiate Call Attempt result: a loop of three members '
                                         '(phases, functionalities, extensions); '
                                         'releaseCallArgExtensionAllowed [3] is stepped over '
                                         '(flag 0x10)',
    'result-sequence-indefinite': 'indefinite result SEQUENCE: one end-of-contents check '
                                  'before the operation code, none after the result, so its '
                                  'end-of-contents is left over (flag 0x10)',
    'long-qos-format-not-compared': 'long QoS format: read as the short format\'s three octets '
                                    'then octets 4 to 11; tshark reads MAP\'s Ext-QoS-Subscribed '
                                    '(allocation priority first), so its values are not compared',
}
