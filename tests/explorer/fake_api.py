#!/usr/bin/env python3
"""A stand-in for corbel serve's HTTP API, for working on the explorer page without root and
without clocks: the four clocks of tools/explorer with the answers' shapes, a history that grows
every second, events, and writes with the token, validation and ptp4l's refusal.

Usage: fake_api.py PORT TOKEN [--read-only]   (listens on 127.0.0.1)
"""
import json
import math
import sys
import threading
import time
from datetime import datetime, timezone
from http.server import BaseHTTPRequestHandler, ThreadingHTTPServer
from pathlib import Path
from urllib.parse import unquote, urlparse

PAGE = Path(__file__).resolve().parents[2] / "corbel" / "explorer"
CHART = Path("/usr/share/javascript/chart.js/chart.min.js")
TYPES = {".html": "text/html", ".js": "text/javascript", ".css": "text/css", ".svg": "image/svg+xml"}
STATES = {6: "MASTER", 8: "UNCALIBRATED"}
LOCK = threading.Lock()


def iso(seconds=None):
    moment = datetime.fromtimestamp(seconds or time.time(), timezone.utc)
    return moment.isoformat(timespec="milliseconds").replace("+00:00", "Z")


def entry(tag, kind, value, settable=False, word=None, unit=None):
    found = {"tag": tag, "type": kind, "value": value}
    found.update({k: v for k, v in (("word", word), ("unit", unit)) if v is not None})
    found["settable"] = settable
    return found


def unread(tag, kind, settable=False):
    return {"tag": tag, "type": kind, "settable": settable, "value": None,
            "error": "not supported by this clock", "reason": "NOT_SUPPORTED"}


def make_clock(mac, domain, prio1, desc, state, clock_class, ptpd=False, master=None):
    identity = "02-11-22-FF-FE-33-44-" + mac
    parent = master + ":1" if master else identity + (":1" if ptpd else ":0")
    values = {
        "userDescription": entry("0xE003000", "string", desc, True),
        "portState": entry("0xE001000", "i32", state, word=STATES[state]),
        "portEnabled": entry("0xE027000", "bool", True, True),
        "logSyncInterval": entry("0xE00C000", "i32", 0, True, "1 s", "log2 s"),
        "domainNumber": entry("0xE005000", "u32", domain, True),
        "priority1": entry("0xE006000", "u32", prio1, True),
        "priority2": entry("0xE007000", "u32", 128, True),
        "clockClass": entry("0xE01B000", "u32", clock_class, word="default"),
        "stepsRemoved": entry("0xE00E000", "u32", 1 if master else 0),
        "offsetFromMaster": entry("0xE00F000", "double", 0, unit="ns"),
        "meanPathDelay": entry("0xE010000", "double", 0, unit="ns"),
        "parentPortIdentity": entry("0xE011000", "string", parent),
        "grandmasterIdentity": entry("0xE014000", "string", parent.split(":")[0]),
        "timeSource": entry("0xE01C000", "u32", 160, word="INTERNAL_OSCILLATOR"),
        "currentUtcOffset": entry("0xE01D000", "u32", 37, unit="s") if ptpd else
        unread("0xE01D000", "u32"),
        "time": entry("0xE024000", "timestamp", iso(), True) if ptpd else
        unread("0xE024000", "timestamp", True),
    }
    return {"item": identity + ":1", "clockIdentity": identity, "domain": domain,
            "present": True, "lastSeen": iso(), "lastRead": iso(), "lastReadOk": True,
            "values": values, "ptpd": ptpd, "samples": []}


CLOCKS = [make_clock("55", 0, 100, "grandmaster-rack-1", 6, 248),
          make_clock("66", 1, 128, "boundary-lab-2", 6, 248),
          make_clock("77", 2, 90, "PTPDv2", 6, 13, ptpd=True),
          make_clock("88", 0, 120, "slave-bench-4", 8, 255, master="02-11-22-FF-FE-33-44-55")]
KEY_VALUES = ["domainNumber", "portState", "priority1", "priority2", "clockClass",
              "grandmasterIdentity", "parentPortIdentity", "stepsRemoved", "offsetFromMaster",
              "meanPathDelay", "userDescription"]
EVENTS = []
STARTED = iso()


def add_event(item, kind, message, detail):
    EVENTS.append({"id": len(EVENTS) + 1, "time": iso(), "item": item, "kind": kind,
                   "message": message, "detail": detail})


def sample_all():
    """A read of every clock each second: a slow wave of offset and delay."""
    while True:
        with LOCK:
            now = time.time()
            for index, clock in enumerate(CLOCKS):
                offset = round(800 * math.sin(now / 20 + index), 1)
                delay = round(4000 + 300 * math.cos(now / 30 + index), 1)
                clock["values"]["offsetFromMaster"]["value"] = offset
                clock["values"]["meanPathDelay"]["value"] = delay
                clock["lastRead"] = clock["lastSeen"] = iso(now)
                clock["samples"] = clock["samples"][-3599:] + [
                    {"time": iso(now), "t": int(now * 1000), "offsetFromMaster": offset,
                     "meanPathDelay": delay, "portState": clock["values"]["portState"]["value"]}]
        time.sleep(1)


def public(clock, every):
    shown = {k: v for k, v in clock.items() if k not in ("ptpd", "samples")}
    if not every:
        shown["values"] = {k: v for k, v in clock["values"].items() if k in KEY_VALUES}
    return shown


def validate(changes):
    sentences = {}
    for name, value in changes.items():
        if name in ("priority1", "priority2") and not 0 <= value <= 255:
            sentences[name] = "Priority values must be integers within the range 0-255."
        if name == "domainNumber" and not 0 <= value <= 3:
            sentences[name] = "Domain must be an integer within the range 0 (PTP default domain) to 3."
    return sentences


def write(clock, changes):
    names = sorted(changes, key=lambda name: clock["values"][name]["tag"])
    if not clock["ptpd"]:
        result = {"error": "refused", "message": "the clock refused " + names[0], "written": [],
                  "refused": {"name": names[0], "reason": "NOT_SUPPORTED"}, "notSent": names[1:]}
        add_event(clock["item"], "refused", "write refused: " + names[0], result)
        return 502, result
    for name in names:
        clock["values"][name]["value"] = changes[name]
    result = {"written": names, "refused": None, "notSent": []}
    add_event(clock["item"], "written", "written: " + ", ".join(names), result)
    return 200, result


class Handler(BaseHTTPRequestHandler):
    token = ""
    read_only = False

    def log_message(self, *args):
        pass

    def answer(self, status, body, kind="application/json; charset=utf-8"):
        data = body if isinstance(body, bytes) else json.dumps(body).encode()
        self.send_response(status)
        self.send_header("Content-Type", kind)
        self.send_header("Content-Length", str(len(data)))
        self.send_header("Cache-Control", "no-store")
        self.send_header("Content-Security-Policy", "default-src 'self'")
        self.end_headers()
        self.wfile.write(data)

    def fail(self, status, word, message, **more):
        self.answer(status, {"error": word, "message": message, **more})

    def find(self, item):
        return next((c for c in CLOCKS if c["item"].upper() == unquote(item).upper()), None)

    def do_GET(self):
        url = urlparse(self.path)
        parts = url.path.strip("/").split("/")
        if url.path == "/" or parts[0] == "assets":
            name = "index.html" if url.path == "/" else parts[-1]
            file = CHART if name == "chart.min.js" else PAGE / name
            if not file.is_file():
                return self.fail(404, "not-found", "no such file")
            return self.answer(200, file.read_bytes(), TYPES.get(file.suffix, "text/plain"))
        with LOCK:
            if parts[:3] == ["api", "v1", "status"]:
                return self.answer(200, {
                    "version": "1.0.2", "listen": "127.0.0.1:%d" % self.server.server_port,
                    "writes": "read-only" if self.read_only else "token", "interval": 1,
                    "rediscover": 30, "started": STARTED,
                    "discovery": {"time": STARTED, "durationSeconds": 1.01, "clocks": 4}})
            if parts[:3] == ["api", "v1", "events"]:
                since = int(url.query.partition("since=")[2] or 0)
                return self.answer(200, {"events": [e for e in EVENTS if e["id"] > since][-1000:],
                                         "last": len(EVENTS)})
            if parts == ["api", "v1", "clocks"]:
                return self.answer(200, {"clocks": [public(c, False) for c in CLOCKS]})
            clock = self.find(parts[3]) if parts[:3] == ["api", "v1", "clocks"] else None
            if clock and len(parts) == 4:
                return self.answer(200, public(clock, True))
            if clock and parts[4:] == ["history"]:
                return self.answer(200, {"item": clock["item"], "interval": 1,
                                         "samples": clock["samples"]})
        self.fail(404, "not-found", "no such route or clock")

    def do_POST(self):
        parts = urlparse(self.path).path.strip("/").split("/")
        if self.read_only:
            return self.fail(403, "forbidden", "this server writes nothing (--read-only)")
        if self.headers.get("Authorization", "") != "Bearer " + self.token:
            return self.fail(401, "unauthorized", "a write needs the server's token.")
        changes = json.loads(self.rfile.read(int(self.headers.get("Content-Length", 0))))
        with LOCK:
            clock = self.find(parts[3]) if len(parts) == 5 and parts[4] == "settings" else None
            if not clock:
                return self.fail(404, "not-found", "no such clock")
            if any(name not in clock["values"] or not clock["values"][name]["settable"]
                   for name in changes):
                return self.fail(400, "bad-request", "unknown setting name")
            sentences = validate(changes)
            if sentences:
                return self.fail(422, "rejected", "rejected by validation", sentences=sentences)
            self.answer(*write(clock, changes))


def main():
    Handler.token = sys.argv[2]
    Handler.read_only = "--read-only" in sys.argv
    for clock in CLOCKS:
        add_event(clock["item"], "appeared", "appeared in domain %d" % clock["domain"], {})
    threading.Thread(target=sample_all, daemon=True).start()
    ThreadingHTTPServer(("127.0.0.1", int(sys.argv[1])), Handler).serve_forever()


if __name__ == "__main__":
    main()
