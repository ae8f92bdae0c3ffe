#!/usr/bin/env python3
"""Generates the shipped catalogs appdata/ellipsoids.ini, datums.ini and
zones.ini from PROJ's EPSG database (proj.db).

Usage: scripts/make-catalogs.py [--proj-db PATH] [--out DIR]

State plane zones of 1983 and 1927 and the UTM zones of the United States are
taken from the EPSG projected CRS definitions. Angles are written in packed
DDD.MMSSsssss form (5 decimals of seconds); false origins are converted
exactly into each zone's linear unit (metres x 3937/1200 for U.S. survey feet,
metres / 0.3048 for international feet). Files are written with CR LF.
"""

import argparse
import math
import os
import sqlite3
import sys
from decimal import Decimal
from fractions import Fraction

DEG = "\u00b0"

TM = "Transverse Mercator"
TM27 = "Transverse Mercator - NAD 27 Equations"
LCC2 = "Lambert Conformal Conic - Two Parallels"
LCC27 = "Lambert Conformal Conic - NAD 27 Equations"
OM = "Oblique Mercator - Hotine"

METERS = "Meters"
US_FEET = "U.S. Survey Feet"
INT_FEET = "International Feet"

# SPCS 83 grid units fixed by state law.
INTERNATIONAL_FOOT_STATES = {"Arizona", "Michigan", "Montana", "North Dakota", "Oregon",
                             "South Carolina"}
METRE_STATES = {"Alabama", "Alaska", "Hawaii", "Missouri", "Puerto Rico"}
# Statutes and EPSG disagree: EPSG's U.S. survey foot is shipped.
DISPUTED_UNIT_STATES = {"Nebraska", "Nevada", "Ohio", "New Jersey", "Utah"}

# Alaska zone 1: the azimuth of the central line is exactly atan(-3/4).
ALASKA_1_AZIMUTH = 360 + math.degrees(math.atan(-3 / 4))

# NADCON areas with their HPGN method texts: (area, suffix).
HPGN_AREAS = [
    ("Alabama", ""), ("Arkansas", ""), ("Arizona", ""),
    ("California", " (Above 37" + DEG + " Latitude)"),
    ("California", " (Below 37" + DEG + " Latitude)"),
    ("Colorado", ""), ("Florida", ""), ("Georgia", ""), ("Guam", ""), ("Hawaii", ""),
    ("Idaho-Montana", " (East of 133" + DEG + " Longitude)"),
    ("Idaho-Montana", " (West of 133" + DEG + " Longitude)"),
    ("Iowa", ""), ("Illinois", ""), ("Indiana", ""), ("Kansas", ""), ("Kentucky", ""),
    ("Louisiana", ""), ("Maryland-Delaware", ""), ("Maine", ""), ("Michigan", ""),
    ("Minnesota", ""), ("Mississippi", ""), ("Missouri", ""), ("Nebraska", ""), ("Nevada", ""),
    ("New England", " (CT, MA, NH, RI, VT)"), ("New Jersey", ""), ("New Mexico", ""),
    ("New York", ""), ("North Carolina", ""), ("North Dakota", ""), ("Ohio", ""),
    ("Oklahoma", ""), ("Pennsylvania", ""), ("Puerto Rico-Virgin Islands", ""),
    ("Samoa (Eastern Islands)", ""), ("Samoa (Western Islands)", ""), ("South Carolina", ""),
    ("South Dakota", ""), ("Tennessee", ""),
    ("Texas", " (East of 100" + DEG + " Longitude)"),
    ("Texas", " (West of 100" + DEG + " Longitude)"),
    ("Utah", ""), ("Virginia", ""), ("Washington-Oregon", ""), ("West Virginia", ""),
    ("Wisconsin", ""), ("Wyoming", ""),
]

ELLIPSOIDS = [
    # short name, EPSG code, scale of the axes (Michigan 1927 only)
    ("Clarke 1866", 7008, None),
    ("GRS 80", 7019, None),
    ("WGS 84", 7030, None),
    ("Clarke 1866 Michigan", 7008, Fraction("1.0000382")),
    ("WGS 72", 7043, None),
    ("GRS 67", 7036, None),
    ("International 1924", 7022, None),
    ("Clarke 1880", 7012, None),
    ("Bessel 1841", 7004, None),
    ("Airy 1830", 7001, None),
    ("Krassowsky 1940", 7024, None),
    ("Everest 1830", 7015, None),
    ("Australian National", 7003, None),
]


def plain(value):
    """A number as plain decimal text without exponent (shortest round trip)."""
    if isinstance(value, Fraction):
        value = float(value)
    text = format(Decimal(repr(float(value))), "f")
    if "." in text:
        text = text.rstrip("0").rstrip(".")
    return "0" if text in ("-0", "") else text


def packed(degrees):
    """Degrees (a Fraction) as packed DDD.MMSSsssss with 5 decimals of seconds."""
    negative = degrees < 0
    units = abs(degrees) * 3600 * 100000  # hundred-thousandths of a second
    units = int(units + Fraction(1, 2))
    seconds_units = units % (60 * 100000)
    minutes_total = units // (60 * 100000)
    d, m = divmod(minutes_total, 60)
    text = "%d.%02d%07d" % (d, m, seconds_units)
    return ("-" if negative else "") + text


def epsg_angle(value, uom):
    """An EPSG parameter angle as a Fraction of degrees."""
    text = repr(float(value))
    if uom == 9102:
        return Fraction(text)
    if uom == 9110:  # sexagesimal DMS: DDD.MMSSsss
        negative = text.startswith("-")
        text = text.lstrip("-")
        whole, _, frac = text.partition(".")
        frac = (frac + "0000")
        minutes = int(frac[:2])
        seconds = Fraction(frac[2:4] + "." + (frac[4:] or "0"))
        deg = int(whole) + Fraction(minutes, 60) + seconds / 3600
        return -deg if negative else deg
    raise ValueError("unexpected angle unit %s" % uom)


def epsg_length_metres(value, uom):
    v = Fraction(repr(float(value)))
    if uom == 9001:
        return v
    if uom == 9003:
        return v * Fraction(1200, 3937)
    if uom == 9002:
        return v * Fraction(3048, 10000)
    raise ValueError("unexpected length unit %s" % uom)


def epsg_length_us_feet(value, uom):
    v = Fraction(repr(float(value)))
    if uom == 9003:
        return v
    return epsg_length_metres(value, uom) * Fraction(3937, 1200)


def metres_to(unit, metres):
    if unit == METERS:
        return metres
    if unit == US_FEET:
        return metres * Fraction(3937, 1200)
    return metres / Fraction(3048, 10000)


class Db:
    def __init__(self, path):
        self.c = sqlite3.connect(path)

    def conversion(self, code):
        row = self.c.execute(
            "select * from conversion where auth_name='EPSG' and code=?", (code,)).fetchone()
        cols = [d[0] for d in self.c.execute("select * from conversion").description]
        r = dict(zip(cols, row))
        params = {}
        for i in range(1, 8):
            name = r["param%d_name" % i]
            if name:
                params[name] = (r["param%d_value" % i], r["param%d_uom_code" % i])
        return r["method_name"], params

    def projected(self, where, args=()):
        return self.c.execute(
            "select code, name, conversion_code from projected_crs where auth_name='EPSG' "
            "and deprecated=0 and " + where + " order by code", args).fetchall()

    def crs_code(self, name):
        row = self.c.execute(
            "select code from projected_crs where auth_name='EPSG' and deprecated=0 and name=?",
            (name,)).fetchone()
        return row[0] if row else None

    def ellipsoid(self, code):
        return self.c.execute(
            "select name, semi_major_axis, inv_flattening, semi_minor_axis from ellipsoid "
            "where auth_name='EPSG' and code=?", (code,)).fetchone()


def zone_entry(db, conversion_code, nad27, unit, full_name, datum, vertical, comp_ellipsoid=""):
    """The key/value list of one zones.ini section."""
    method, p = db.conversion(conversion_code)
    keys = []
    if method == "Transverse Mercator":
        lat = epsg_angle(*p["Latitude of natural origin"])
        lon = epsg_angle(*p["Longitude of natural origin"])
        k0 = p["Scale factor at natural origin"][0]
        fe, fn = p["False easting"], p["False northing"]
        projection = TM27 if nad27 else TM
        extra = [("Scale Factor", plain(k0))]
    elif method in ("Lambert Conic Conformal (2SP)", "Lambert Conic Conformal (2SP Michigan)"):
        lat = epsg_angle(*p["Latitude of false origin"])
        lon = epsg_angle(*p["Longitude of false origin"])
        p1 = epsg_angle(*p["Latitude of 1st standard parallel"])
        p2 = epsg_angle(*p["Latitude of 2nd standard parallel"])
        fe, fn = p["Easting at false origin"], p["Northing at false origin"]
        projection = LCC27 if nad27 else LCC2
        extra = [("Northern Parallel", packed(max(p1, p2))),
                 ("Southern Parallel", packed(min(p1, p2)))]
        if method.endswith("Michigan)"):
            assert comp_ellipsoid == "Clarke 1866 Michigan"
            assert abs(p["Ellipsoid scaling factor"][0] - 1.0000382) < 1e-12
            projection = LCC2  # the NAD 27 equations fix the Clarke 1866 arcs
    elif method == "Hotine Oblique Mercator (variant A)":
        lat = epsg_angle(*p["Latitude of projection centre"])
        lon = epsg_angle(*p["Longitude of projection centre"])
        k0 = p["Scale factor on initial line"][0]
        fe, fn = p["False easting"], p["False northing"]
        projection = OM
        azimuth = epsg_angle(*p["Azimuth of initial line"])
        assert abs(float(azimuth) - ALASKA_1_AZIMUTH) < 1e-7, azimuth
        extra = [("Scale Factor", plain(k0)),
                 ("Azimuth", packed(Fraction(ALASKA_1_AZIMUTH)))]
    else:
        raise ValueError("unexpected method %s" % method)

    if nad27:
        northing = epsg_length_us_feet(*fn)
        easting = epsg_length_us_feet(*fe)
        assert unit == US_FEET
        # The NAD 27 equations add no false northing: zones that have one are
        # computed with the rigorous forms on the same ellipsoid.
        if northing != 0 and projection in (TM27, LCC27):
            projection = TM if projection == TM27 else LCC2
    else:
        northing = metres_to(unit, epsg_length_metres(*fn))
        easting = metres_to(unit, epsg_length_metres(*fe))

    # Central meridians east of Greenwich (UTM 59N, 60N) are written east-positive.
    lon_direction = "E" if lon > 0 else "W"
    keys = [("Full Name", full_name), ("Horizontal Datum", datum),
            ("Computational Ellipsoid", comp_ellipsoid), ("Vertical Datum", vertical),
            ("Projection", projection), ("Show In", "1"), ("Show Out", "1"),
            ("Central Latitude", packed(lat)),
            ("Central Longitude", packed(lon if lon > 0 else -lon)),
            ("False Northing", plain(northing)), ("False Easting", plain(easting))]
    keys += extra
    keys += [("Positive Latitude Direction", "N"),
             ("Positive Longitude Direction", lon_direction), ("Linear Units", unit)]
    order = ["Full Name", "Horizontal Datum", "Computational Ellipsoid", "Vertical Datum",
             "Projection", "Show In", "Show Out", "Central Latitude", "Central Longitude",
             "False Northing", "False Easting", "Scale Factor", "Northern Parallel",
             "Southern Parallel", "Azimuth", "Positive Latitude Direction",
             "Positive Longitude Direction", "Linear Units"]
    keys.sort(key=lambda kv: order.index(kv[0]))
    return keys


def tidy_zone_name(name):
    return name.replace(" zone ", " Zone ")


def spcs83_code(conversion_code):
    special = {15303: 1601, 15040: 5010}
    if conversion_code in special:
        return special[conversion_code]
    state = conversion_code // 100 % 100
    last = conversion_code % 100
    if state == 21:  # Michigan 2111-2113
        return 2100 + last - 30
    assert 30 <= last <= 39, conversion_code
    return state * 100 + last - 30


def state_of(zone_name):
    for prefix in sorted(INTERNATIONAL_FOOT_STATES | METRE_STATES | DISPUTED_UNIT_STATES,
                         key=len, reverse=True):
        if zone_name.startswith(prefix):
            return prefix
    return zone_name.split(" ")[0]


def spcs83_zones(db):
    zones = []
    rows = db.projected(
        "geodetic_crs_auth_name='EPSG' and geodetic_crs_code='4269' and conversion_code in "
        "(select code from conversion where auth_name='EPSG' and name like 'SPCS83 %' and "
        "(name like '%(meters)' or name like '%(meter)'))")
    for crs, name, conv in rows:
        zone = tidy_zone_name(name.split(" / ", 1)[1])
        code = spcs83_code(conv)
        state = state_of(zone)
        if state in INTERNATIONAL_FOOT_STATES:
            unit, suffix = INT_FEET, " (ft)"
        elif state in METRE_STATES:
            unit, suffix = METERS, None
        else:
            unit, suffix = US_FEET, " (ftUS)"
        epsg = crs
        if suffix:
            feet = db.crs_code(name + suffix)
            if feet:
                epsg = feet
        full = "%s %04d (EPSG:%d)" % (zone, code, epsg)
        if state in DISPUTED_UNIT_STATES:
            full += ", unit as EPSG gives it; state statutes differ"
        vertical = "" if state in ("Hawaii", "Puerto Rico") else "NAVD 88"
        short = "%s %04d" % (zone, code)
        zones.append((code, short, zone_entry(db, conv, False, unit, full, "NAD 83", vertical)))
    zones.sort(key=lambda z: z[0])
    return [(short, keys) for _, short, keys in zones]


SPCS27_SPECIAL = {
    5623: 2101, 5624: 2102, 5625: 2103,  # Michigan transverse Mercator zones (1934)
    6966: 2111, 6201: 2112, 6202: 2113,  # Michigan Lambert zones (1964)
    4456: 3104, 4455: 3702, 2204: 4100, 26799: 407, 32099: 1703,
    3561: 5101, 3562: 5102, 3563: 5103, 3564: 5104, 3565: 5105,
    3991: 5201, 3992: 5202,
}


def spcs27_zones(db):
    zones = []
    rows = db.projected(
        "geodetic_crs_auth_name='EPSG' and geodetic_crs_code in ('4267','4135','4139') and "
        "conversion_code in (select code from conversion where auth_name='EPSG' and "
        "(name like '%CS27%' or name like 'Arizona Coordinate System%' or "
        "name like 'Michigan State Plane%' or name like 'Hawaii CS27%' or "
        "name like 'Puerto Rico%'))")
    for crs, name, conv in rows:
        zone = tidy_zone_name(name.split(" / ", 1)[1] if " / " in name else name)
        if crs == 3991:
            zone = "Puerto Rico & Virgin Is."
        elif crs == 3992:
            zone = "St. Croix"
        code = SPCS27_SPECIAL.get(crs, conv % 10000)
        datum_note = ""
        if crs in (3561, 3562, 3563, 3564, 3565):
            datum_note = ", Old Hawaiian datum"
        elif crs in (3991, 3992):
            datum_note = ", Puerto Rico datum"
        comp = "Clarke 1866 Michigan" if code in (2111, 2112, 2113) else ""
        full = "%s %04d (EPSG:%d%s)" % (zone, code, crs, datum_note)
        vertical = "" if datum_note else "NGVD 29"
        short = "%s %04d" % (zone, code)
        zones.append((code, short, zone_entry(db, conv, True, US_FEET, full, "NAD 27", vertical,
                                               comp)))
    zones.sort(key=lambda z: z[0])
    return [(short, keys) for _, short, keys in zones]


# UTM zones north of the United States: 1N to 20N, and 59N, 60N for the
# western Aleutians.
UTM_ZONES = list(range(1, 21)) + [59, 60]


def utm_zones(db, geodetic, datum, vertical):
    zones = []
    for n in UTM_ZONES:
        name = "%s / UTM zone %dN" % (datum.replace(" ", ""), n)
        row = db.c.execute(
            "select code, conversion_code from projected_crs where auth_name='EPSG' and "
            "deprecated=0 and name=? and geodetic_crs_code=?", (name, geodetic)).fetchone()
        assert row, name
        crs = row[0]
        full = "UTM zone %dN, %s (EPSG:%d)" % (n, datum, crs)
        zones.append(("Zone %dN" % n,
                      zone_entry(db, row[1], False, METERS, full, datum, vertical)))
    return zones


def ellipsoid_sections(db):
    sections = []
    for short, code, scale in ELLIPSOIDS:
        name, a, rf, b = db.ellipsoid(code)
        a = Fraction(repr(a))
        if b is not None:
            b = Fraction(repr(b))
        if scale:
            a *= scale
            b *= scale
        a_f = float(a)
        if b is None:
            f = 1 / float(rf)
            b_f = a_f - a_f * f
        else:
            b_f = float(b)
            f = (a_f - b_f) / a_f
        e = math.sqrt(a_f * a_f - b_f * b_f) / a_f
        if b is None:
            full = "%s, 1/f = %s (EPSG:%d)" % (name, plain(rf), code)
        elif scale:
            full = "Clarke 1866 with axes x 1.0000382 (Michigan 1927 Lambert zones)"
        else:
            full = "%s (EPSG:%d)" % (name, code)
        sections.append((short, [("Full Name", full), ("Semimajor Axis", plain(a_f)),
                                 ("Semiminor Axis", plain(b_f)), ("Flattening", plain(f)),
                                 ("Eccentricity", plain(e)), ("Show", "1")]))
    return sections


def hpgn_datum_name(area, suffix):
    return area + " HPGN" + suffix


def datum_sections():
    sections = []
    nad83_keys = [("NAD 27", "NADCON NAD 83 to NAD 27")]
    hpgn = []
    for area, suffix in HPGN_AREAS:
        name = hpgn_datum_name(area, suffix)
        to_hpgn = "NADCON NAD 83 (1986) to " + area + " HPGN" + suffix
        back_year = "1996" if area == "Alabama" else "1986"
        from_hpgn = "NADCON " + area + " HPGN to NAD 83 (" + back_year + ")" + suffix
        nad83_keys.append((name, to_hpgn))
        hpgn.append((name, [("Full Name", "NAD 83 High Precision Geodetic Network, " + area +
                             suffix),
                            ("Type", "Horizontal"), ("Ellipsoid", "GRS 80"), ("Show In", "1"),
                            ("Show Out", "1"), ("NAD 83", from_hpgn)]))
    sections.append(("NAD 27", [("Full Name", "North American Datum of 1927"),
                                ("Type", "Horizontal"), ("Ellipsoid", "Clarke 1866"),
                                ("Show In", "1"), ("Show Out", "1"),
                                ("NAD 83", "NADCON NAD 27 to NAD 83")]))
    sections.append(("NAD 83", [("Full Name", "North American Datum of 1983 (1986)"),
                                ("Type", "Horizontal"), ("Ellipsoid", "GRS 80"),
                                ("Show In", "1"), ("Show Out", "1")] + nad83_keys))
    sections += hpgn
    sections.append(("NGVD 29", [("Full Name", "National Geodetic Vertical Datum of 1929"),
                                 ("Type", "Vertical"), ("Show In", "1"), ("Show Out", "1"),
                                 ("NAVD 88", "VERTCON NGVD 29 to NAVD 88")]))
    sections.append(("NAVD 88", [("Full Name", "North American Vertical Datum of 1988"),
                                 ("Type", "Vertical"), ("Show In", "1"), ("Show Out", "1"),
                                 ("NGVD 29", "VERTCON NAVD 88 to NGVD 29"),
                                 ("NAD 83 Ellipsoid", "GEOID09 NAVD 88 to NAD 83")]))
    sections.append(("NAD 83 Ellipsoid",
                     [("Full Name", "NAD 83 with ellipsoid heights (GEOID09 to NAVD 88)"),
                      ("Type", "3D"), ("Ellipsoid", "GRS 80"), ("Show In", "1"),
                      ("Show Out", "1"), ("NAVD 88", "GEOID09 NAD 83 to NAVD 88")]))
    return sections


def write_ini(path, sections, header):
    lines = ["; " + h for h in header]
    for name, keys in sections:
        if lines:
            lines.append("")
        lines.append("[" + name + "]")
        lines += ["%s=%s" % kv for kv in keys]
    data = "\r\n".join(lines) + "\r\n"
    tmp = path + ".tmp"
    with open(tmp, "w", encoding="utf-8", newline="") as f:
        f.write(data)
    os.replace(tmp, path)


def main():
    parser = argparse.ArgumentParser(description=__doc__.splitlines()[0])
    parser.add_argument("--proj-db", default="/usr/share/proj/proj.db")
    here = os.path.dirname(os.path.abspath(__file__))
    parser.add_argument("--out", default=os.path.join(here, "..", "appdata"))
    args = parser.parse_args()
    db = Db(args.proj_db)
    version = db.c.execute(
        "select value from metadata where key='EPSG.VERSION'").fetchone()
    source = "EPSG %s via PROJ's proj.db" % (version[0] if version else "dataset")
    note = ["Generated by scripts/make-catalogs.py from the " + source + "."]

    write_ini(os.path.join(args.out, "ellipsoids.ini"), ellipsoid_sections(db), note)
    write_ini(os.path.join(args.out, "datums.ini"), datum_sections(), note)

    zones = []
    counts = {}
    for system, entries in (
            ("State Plane 1983", spcs83_zones(db)),
            ("State Plane 1927", spcs27_zones(db)),
            ("UTM NAD 83", utm_zones(db, "4269", "NAD 83", "NAVD 88")),
            ("UTM NAD 27", utm_zones(db, "4267", "NAD 27", "NGVD 29"))):
        counts[system] = len(entries)
        zones += [(system + "~" + short, keys) for short, keys in entries]
    names = [n.lower() for n, _ in zones]
    assert len(names) == len(set(names)), "duplicate zone sections"
    write_ini(os.path.join(args.out, "zones.ini"), zones, note)
    for system, n in counts.items():
        print("%s: %d zones" % (system, n))


if __name__ == "__main__":
    sys.exit(main())
