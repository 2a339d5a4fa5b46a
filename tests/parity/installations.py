"""Made-up installations for compare_platforms.py: folders of targets as a user might have them, and some that nobody
would. The same number gives the same installation in every run."""
import random

WORDS = ['Board', 'board two', 'Zé', '日本', 'v1.0', 'a-b', "it's", 'X & Y', 'Spartan6', 'K', 'menus', 'deep', 'Ünder']
FAMILIES = ['Spartan6', 'Virtex5', 'Kintex7', 'virtex6']
PROPERTIES = ['DeviceCategory', 'EIOItemIconName', 'FPGAItemSubType', 'SupportedFPGAHostList', 'TargetClass',
              'FindTargetVIPath', 'DeviceIDs', 'CustomFPGAMethodList', 'Speed', 'Label', 'speed']
VALUES = ['', '1', 'true', ' spaced  out ', 'a,b', 'a\\,b', 'Targets/QN/x', '#{name}', '#{unknown}', 'é日', '&lt;&amp;&gt;',
          'two\nlines', '-', "'", '\t', 'FpgaDeviceSpecs/Spartan6/']


def element(r, depth):
    kind = r.randrange(9 if depth > 0 else 6)
    name = r.choice(PROPERTIES + ['Clock', 'Bank', 'Part'])
    attribute = ' name="%s"' % r.choice(['A', 'a', 'B/1', 'C-1', '#{name}', 'P'])
    if kind <= 3:
        return '<%s>%s</%s>' % (name, r.choice(VALUES), name)
    if kind == 4:
        return '<%s localize="true">eng=%s,jpn=日本,chs=x</%s>' % (name, r.choice(WORDS).replace('&', '+'), name)
    if kind == 5:
        return '<:Link%s>%s</:Link>' % (attribute, r.choice(['A', '../A', '/FpgaDeviceSpecs', 'none/at all', '#{name}']))
    body = ''.join(element(r, depth - 1) for _ in range(r.randrange(4)))
    if kind == 6:
        return '<%s%s ordered="true">%s</%s>' % (name, attribute, body, name)
    if kind == 7:
        return '<%s names="%s">%s</%s>' % (name, r.choice(['x, y', 'D[0..3]', 'n:i=[1..2]', '']), body, name)
    return '<%s%s prototype="%s">%s</%s>' % (name, attribute, r.choice(['A', '/Parts/P', 'missing']), body, name)


def document(r, root, name, extra=''):
    text = '<%s name="%s">%s%s</%s>' % (root, name, extra, ''.join(element(r, 3) for _ in range(r.randrange(8))), root)
    fault = r.randrange(14)
    if fault == 0:
        text = text[:-3]
    if fault == 1:
        text += '<more/>'
    lead = r.choice(['', '', '<?xml version="1.0"?>\n', '\ufeff', '<!-- x -->'])
    data = (lead + text).encode('utf-8')
    return data.replace(b'><', b'>\n<') if r.randrange(2) else data


def device_specs(r):
    families = ''.join('<%s><XIPINMenusPath>%s</XIPINMenusPath></%s>' % (f, r.choice(['Targets\\QN\\FPGA\\menus\\' + f,
                       'Targets/QN/FPGA/menus/' + f.upper(), 'menus', '']), f) for f in FAMILIES if r.randrange(16))
    return ('<FpgaDeviceSpecs>%s</FpgaDeviceSpecs>' % families).encode()


def make(number):
    """The files of the installation `number`, by their paths with slashes; a folder has None."""
    r = random.Random(number)
    files = {'Zarvik.exe': b'MZ', 'Targets/QN/FPGA/Tool': None}
    base = 'Targets/QN/FPGA/'
    if r.randrange(8):
        files[base + r.choice(['specs_resource.xml', 'A/Specs_RESOURCE.XML', 'zz resource.xml'])] = device_specs(r)
    if r.randrange(3):
        files[base + 'hosts_resource.xml'] = document(r, 'FPGAHostSet', '')
    for family in FAMILIES:
        for n in range(r.randrange(3)):
            files[base + 'menus/%s/%s/%d.mnu' % (family, r.choice(WORDS), n)] = r.randbytes(r.randrange(9000))
    for n in range(r.randrange(6)):
        folder = base + '/'.join(r.choice(WORDS) for _ in range(1 + r.randrange(3))) + '/'
        extra = '<DeviceFamily>%s</DeviceFamily>' % r.choice(FAMILIES * 4 + ['none'])
        if r.randrange(3) == 0:
            extra += '<:Include what="%s">%s</:Include>' % (r.choice(['children', 'node', '']),
                                                            r.choice([base + 'shared.xml', 'nowhere.xml', base]))
        root = r.choice(['Target', 'Target', 'target', 'Parts', 'Other'])
        files[folder + r.choice(['resource.xml', 'T_resource.xml', 'b%d_Resource.xml' % n])] = \
            document(r, root, r.choice(WORDS).replace('&', '&amp;'), extra)
    if r.randrange(2):
        files[base + 'shared.xml'] = document(r, 'Shared', 'S')
    if r.randrange(4) == 0:
        files[base + 'resource_cache.xml'] = b'old'
    return files
