"""Mixed clients of a server of CIM-XML, for load.sh: see its --help.

    load.py PORT PID NAME PASSWORD MINUTES CLIENTS PERCENT

PID is the server's, at PORT of this machine by HTTPS. Server, tools and clients together take no
more than PERCENT of one core. Prints a line a minute, what was done, and what grew.
"""
import base64, collections, contextlib, glob, http.client, os, random, re, socket, ssl, sys, threading, time
from xml.sax.saxutils import escape, quoteattr

PORT, PID, NAME, PASSWORD = int(sys.argv[1]), sys.argv[2], sys.argv[3], sys.argv[4]
MINUTES, CLIENTS, PERCENT = float(sys.argv[5]), int(sys.argv[6]), float(sys.argv[7])
HOST = "1111-AAA*0000001"
CLASSES = ["ORXC_" + name for name in (
    "CEC_CS LPAR_CS ApiHost ApiPartition HostConnection HostedPartition VirtualSystemSettingData "
    "MemoryRASettingData EthernetAdapterRASettingData ProcessorPool ConcreteJob").split()]
if MINUTES < 2:
    sys.exit("what grows shows in two minutes at the least")
TLS = ssl._create_unverified_context()
LEFT_OPEN_SECONDS = 20
FREE_KB = 4096  # memory that comes and goes with the jobs of the last five minutes

# -- messages -------------------------------------------------------------------------------------

def path(cls, **keys):
    return "<INSTANCENAME CLASSNAME=%s>%s</INSTANCENAME>" % (quoteattr(cls), "".join(
        '<KEYBINDING NAME="%s"><KEYVALUE VALUETYPE="string">%s</KEYVALUE></KEYBINDING>'
        % (key, escape(value)) for key, value in keys.items()))

def system(cls, name):
    return path(cls, CreationClassName=cls, Name=name)

def setting(cls, name):
    return path("ORXC_" + cls, InstanceID="ORX:4*%s*%s" % (name, HOST))

def class_name(name):
    return '<CLASSNAME NAME="%s"/>' % name

def value(text):
    return "<VALUE>%s</VALUE>" % escape(text)

def reference(text):
    return "<VALUE.REFERENCE>%s</VALUE.REFERENCE>" % text

SPACE = '<LOCALNAMESPACEPATH><NAMESPACE NAME="root"/><NAMESPACE NAME="cimv2"/></LOCALNAMESPACEPATH>'
SERVICE = path("ORXC_VirtualSystemManagementService", SystemCreationClassName="ORXC_CEC_CS",
               SystemName=HOST, CreationClassName="ORXC_VirtualSystemManagementService",
               Name="VirtualSystemManagement")

def message(call):
    return ('<?xml version="1.0"?><CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="1" '
            'PROTOCOLVERSION="1.0"><SIMPLEREQ>%s</SIMPLEREQ></MESSAGE></CIM>' % call)

def operation(name, arguments):
    return message('<IMETHODCALL NAME="%s">%s%s</IMETHODCALL>' % (name, SPACE, "".join(
        '<IPARAMVALUE NAME="%s">%s</IPARAMVALUE>' % each for each in arguments.items())))

def method(name, arguments):
    return message(
        '<METHODCALL NAME="%s"><LOCALINSTANCEPATH>%s%s</LOCALINSTANCEPATH>%s</METHODCALL>'
        % (name, SPACE, SERVICE, "".join(arguments)))

# -- a client -------------------------------------------------------------------------------------

class Unexpected(Exception):
    pass

class Client:
    def __init__(self, number):
        self.connection = None
        self.number = number
        self.partition = "36"[number % 2]  # of which it alone changes this slot
        self.slot = str(5 + number // 2)

    def head(self, name, password=PASSWORD):
        token = base64.b64encode(("%s:%s" % (NAME, password)).encode()).decode()
        return {"Content-Type": "application/xml", "CIMOperation": "MethodCall", "CIMMethod": name,
                "CIMObject": "root/cimv2", "Authorization": "Basic " + token}

    def close(self):
        if self.connection:
            self.connection.close()
        self.connection = None

    def post(self, name, body, password=PASSWORD):
        """HTTP status and answer."""
        if self.connection is None or random.random() < 0.1:
            self.close()
            self.connection = http.client.HTTPSConnection("127.0.0.1", PORT, timeout=120,
                                                          context=TLS)
        self.connection.request("POST", "/cimom", body.encode(), self.head(name, password))
        answer = self.connection.getresponse()
        text = answer.read().decode()
        if answer.will_close:
            self.close()
        return answer.status, text

    def ask(self, name, body, expected=0):
        """The answer, whose CIM status has to be the expected one."""
        http_status, text = self.post(name, body)
        found = re.search(r'<ERROR CODE="(\d+)" DESCRIPTION="([^"]*)', text)
        status = int(found.group(1)) if found else 0
        if http_status != 200 or status != expected:
            raise Unexpected("%s: HTTP %d, %d %s" % (name, http_status, status,
                                                     found.group(2) if found else ""))
        return text

    def call(self, name, **arguments):
        return self.ask(name, operation(name, arguments))

    # what it does
    def enumerate(self):
        name = random.choice(["EnumerateInstances", "EnumerateInstanceNames"])
        self.call(name, ClassName=class_name(random.choice(CLASSES)))

    def get(self):
        self.call("GetInstance", InstanceName=random.choice([
            system("ORXC_CEC_CS", HOST), system("ORXC_LPAR_CS", "3*" + HOST),
            setting("MemoryRASettingData", "4")]))

    def associate(self):
        self.call(random.choice(["Associators", "AssociatorNames", "References"]),
                  ObjectName=system(*random.choice([("ORXC_CEC_CS", HOST),
                                                    ("ORXC_LPAR_CS", "4*" + HOST)])))

    def pull(self):
        text = self.call("OpenEnumerateInstances", ClassName=class_name(random.choice(CLASSES)),
                         MaxObjectCount=value("5"))
        while not re.search('NAME="EndOfSequence"[^>]*><VALUE>TRUE', text):
            context = re.search('NAME="EnumerationContext"[^>]*><VALUE>([^<]+)', text).group(1)
            text = self.call("PullInstancesWithPath", EnumerationContext=value(context),
                             MaxObjectCount=value("5"))

    def pull_left_open(self):
        with lock:
            if left_open[0] > time.time() - LEFT_OPEN_SECONDS:
                return
            left_open.append(time.time())
        self.call("OpenEnumerateInstances", ClassName=class_name("ORXC_MemoryRASettingData"),
                  OperationTimeout=value(str(LEFT_OPEN_SECONDS)), MaxObjectCount=value("1"))

    def rename(self):
        name = "load %d %d" % (self.number, random.randrange(1000))
        self.ask("ModifyInstance", operation("ModifyInstance", {
            "ModifiedInstance": '<VALUE.NAMEDINSTANCE>%s<INSTANCE CLASSNAME="ORXC_LPAR_CS">'
            '<PROPERTY NAME="ElementName" TYPE="string">%s</PROPERTY></INSTANCE>'
            "</VALUE.NAMEDINSTANCE>" % (system("ORXC_LPAR_CS", "4*" + HOST), value(name)),
            "PropertyList": "<VALUE.ARRAY>%s</VALUE.ARRAY>" % value("ElementName")}))

    def job(self, name, arguments):
        text = self.ask(name, method(name, arguments))
        if ">4096<" not in text:
            raise Unexpected("%s started no job: %s" % (name, text))
        job = path("ORXC_ConcreteJob", InstanceID=re.search("ORX:JOB[^<]+", text).group())
        for _ in range(600):
            text = self.call("GetInstance", InstanceName=job)
            state = int(re.search('NAME="JobState"[^>]*><VALUE>(\\d+)', text).group(1))
            if state >= 7:
                if state != 7:
                    raise Unexpected("%s: a job ended with state %d, %s" % (name, state, re.findall(
                        'NAME="ErrorDescription"[^>]*><VALUE>([^<]*)', text)))
                return
            time.sleep(0.1)
        raise Unexpected("%s: a job does not end" % name)

    def change_and_back(self):
        if self.number >= 8:
            return
        adapter = ('<INSTANCE CLASSNAME="ORXC_EthernetAdapterRASettingData"><PROPERTY NAME="SlotID"'
                   ' TYPE="uint32"><VALUE>%s</VALUE></PROPERTY><PROPERTY NAME="PortVLANID" '
                   'TYPE="uint16"><VALUE>3</VALUE></PROPERTY></INSTANCE>' % self.slot)
        self.job("AddResourceSettings", [
            '<PARAMVALUE NAME="AffectedConfiguration" PARAMTYPE="reference">%s</PARAMVALUE>'
            % reference(setting("VirtualSystemSettingData", self.partition)),
            '<PARAMVALUE NAME="ResourceSettings" PARAMTYPE="string" EmbeddedObject="instance">'
            "<VALUE.ARRAY>%s</VALUE.ARRAY></PARAMVALUE>" % value(adapter)])
        self.job("RemoveResourceSettings", [
            '<PARAMVALUE NAME="ResourceSettings" PARAMTYPE="reference"><VALUE.REFARRAY>%s'
            "</VALUE.REFARRAY></PARAMVALUE>" % reference(setting(
                "EthernetAdapterRASettingData", self.slot + "*" + self.partition))])

    def ask_wrongly(self):
        name, cls = "GetInstance", "ORXC_LPAR_CS"
        body = operation(name, {"InstanceName": system(cls, "99*" + HOST)})
        kind = random.randrange(6)
        if kind < 2:
            self.ask(name, body if kind else body.replace(cls, "ORXC_Unknown"), 6 if kind else 5)
            return
        status, _ = [self.post(name, body[:-9]),
                     self.post(name, "<!DOCTYPE a [<!ENTITY b 'c'>]>" + body[21:]),
                     self.post(name, "<CIM>" * 1000),
                     self.post(name, body, "wrong password")][kind - 2]
        if status != (401 if kind == 5 else 400):
            raise Unexpected("a wrong request (%d): HTTP %d" % (kind, status))

    def go_away(self):
        body = operation("EnumerateInstances",
                         {"ClassName": class_name("ORXC_EthernetAdapterRASettingData")}).encode()
        head = self.head("EnumerateInstances")
        head["Content-Length"] = str(len(body))
        request = "POST /cimom HTTP/1.1\r\nHost: x\r\n%s\r\n" % "".join(
            "%s: %s\r\n" % line for line in head.items())
        request = request.encode() + body
        with socket.create_connection(("127.0.0.1", PORT), 60) as plain:
            if random.random() < 0.2:
                return
            with TLS.wrap_socket(plain) as connection:
                if random.random() < 0.5:
                    connection.sendall(request[:random.randrange(len(request))])
                else:
                    connection.sendall(request)
                    connection.recv(random.choice([1, 5000]))

WEIGHTS = {"enumerate": 4, "get": 4, "associate": 3, "pull": 2, "pull_left_open": 1, "rename": 1,
           "change_and_back": 2, "ask_wrongly": 2, "go_away": 2}

# -- all of them ----------------------------------------------------------------------------------

done, faults, lock = collections.Counter(), collections.Counter(), threading.Lock()
left_open = collections.deque([0] * 40, 40)  # of the 64 that the server holds
ending, resting = threading.Event(), threading.Event()
busy = 0
began = time.time()

def processor_seconds():
    with open("/proc/%s/stat" % PID) as file:
        ticks = file.read().rsplit(")", 1)[1].split()[11:15]
    return sum(map(int, ticks)) / os.sysconf("SC_CLK_TCK") + time.process_time()

def run(number):
    global busy
    client = Client(number)
    while not ending.is_set():
        if resting.is_set() or processor_seconds() > (time.time() - began) * PERCENT / 100:
            if resting.is_set():
                client.close()
            time.sleep(0.2 * random.random())
            continue
        with lock:
            busy += 1
        what = random.choices(list(WEIGHTS), list(WEIGHTS.values()))[0]
        try:
            getattr(client, what)()
        except Exception as error:         # whatever it is, it should not have been
            client.close()
            with lock:
                faults["%s: %s %s" % (what, type(error).__name__, error)] += 1
        with lock:
            done[what] += 1
            busy -= 1
    client.close()

def look():
    with open("/proc/%s/status" % PID) as file:
        status = dict(line.split(":", 1) for line in file)
    children = 0
    for each in glob.glob("/proc/%s/task/*/children" % PID):
        with contextlib.suppress(OSError):  # the thread has ended meanwhile
            with open(each) as file:
                children += len(file.read().split())
    return {"resident KB": int(status["VmRSS"].split()[0]), "threads": int(status["Threads"]),
            "descriptors": len(os.listdir("/proc/%s/fd" % PID)), "children": children}

def at_rest():
    """The least of each while no client is there."""
    resting.set()
    while busy:
        time.sleep(0.1)
    least = look()
    for _ in range(30):
        time.sleep(0.5)
        least = {key: min(least[key], now) for key, now in look().items()}
    resting.clear()
    return least

def report(when, what):
    print("%8s  %s  requests %d" % (when, "  ".join("%s %d" % each for each in what.items()),
                                    sum(done.values())), flush=True)

# The server keeps a thread, with a descriptor, for each connection that it ever had at once: at the
# beginning, so many that there will not be more.
with contextlib.ExitStack() as connections:
    for _ in range(4 * CLIENTS):
        connections.enter_context(TLS.wrap_socket(socket.create_connection(("127.0.0.1", PORT), 60)))

for number in range(CLIENTS):
    threading.Thread(target=run, args=(number,), daemon=True).start()
first, next_minute, most = None, 60, look()
while time.time() - began < MINUTES * 60:
    time.sleep(10)
    most = {key: max(most[key], now) for key, now in look().items()}
    if time.time() - began >= next_minute:
        report("%d min" % (next_minute // 60), most)
        next_minute += 60
        if first is None:
            first = at_rest()
            report("at rest", first)
        most = look()
last = at_rest()
ending.set()
report("at rest", last)
for what, count in done.items():
    print("%8d  %s" % (count, what))
for what, count in faults.items():
    print("%8d  unexpected: %s" % (count, what))
free = {"resident KB": FREE_KB}
grown = [key for key in last if last[key] > first[key] + free.get(key, 0)]
print("grown: %s" % (", ".join(grown) or "nothing"))
sys.exit(bool(faults or grown))
