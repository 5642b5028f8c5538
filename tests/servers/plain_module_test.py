"""The plain providers in the module's place: the same answers, and processor time that can be read."""

import bench_requests
from measured_server import Measured_Server, write_inventory
from server_case import ServerCase

HOST = ["--adapters", "2", "--ports", "2", "--targets", "2", "--luns", "2", "--cna", "0"]


class Plain_Module(ServerCase):
    once_a_kind = True

    def setUp(self):
        # Without a first start of its own: this one is made by what is measured.
        self.measured = Measured_Server()
        self.addCleanup(self.measured.server.kill)

    def test_plain_providers_answer_what_the_module_answers(self):
        first, host = bench_requests.names("KALDERA_AgentService"), write_inventory(HOST)
        self.measured.start(host, first)
        questions = bench_requests.questions(self.measured.answer)
        expected = [bench_requests.objects_in(self.measured.answer(each.message)) for each in questions]

        self.measured.stop()
        self.measured.take_plain_providers()
        self.measured.start(host, questions[0].message)
        for question, answer in zip(questions, expected, strict=True):
            found = bench_requests.objects_in(self.measured.answer(question.message))
            self.assertIsNone(bench_requests.difference(found, answer), question.title)
            figures = self.measured.measure(question.message, 2)
            self.assertGreater(figures["provider"], 0)
            self.assertGreater(figures["others"], 0)
            self.assertEqual(len(figures["seconds"]), 2)
